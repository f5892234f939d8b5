#include "tools/qorvio/terminal/Printable.h"

#include <algorithm>
#include <cstdio>
#include <utility>

namespace qor::tool {
namespace {

struct Character {
  char32_t code;     // 0 for a byte that begins none
  std::size_t size;  // in bytes
};

// The UTF-8 character at the front; shortest forms alone, and no surrogates.
Character frontOf(std::string_view text) {
  const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(i < text.size() ? text[i] : 0); };
  const unsigned first = byte(0);
  if (first < 0x80) return {first, 1};
  const std::size_t size = first >= 0xF0 ? 4 : first >= 0xE0 ? 3 : 2;
  char32_t code = first & (0xFFU >> (size + 1));
  for (std::size_t i = 1; i < size; ++i) {
    if ((byte(i) & 0xC0) != 0x80) return {0, 1};
    code = code << 6 | (byte(i) & 0x3FU);
  }
  constexpr char32_t least[] = {0x80, 0x800, 0x10000};
  const bool isGood = first >= 0xC2 && first <= 0xF4 && code >= least[size - 2] && code <= 0x10FFFF &&
                      (code < 0xD800 || code > 0xDFFF);
  return isGood ? Character{code, size} : Character{0, 1};
}

bool isControl(char32_t code) {
  // The last ones turn the direction of the text around.
  return (code < 0x20 && code != '\n' && code != '\t') || (code >= 0x7F && code < 0xA0) ||
         (code >= 0x202A && code <= 0x202E) || (code >= 0x2066 && code <= 0x2069);
}

constexpr std::pair<char32_t, char32_t> combining[] = {
    {0x300, 0x36F},   {0x483, 0x489},   {0x591, 0x5BD},   {0x610, 0x61A},   {0x64B, 0x65F},  {0x1AB0, 0x1AFF},
    {0x1DC0, 0x1DFF}, {0x200B, 0x200F}, {0x20D0, 0x20FF}, {0xFE00, 0xFE0F}, {0xFE20, 0xFE2F}};
constexpr std::pair<char32_t, char32_t> wide[] = {{0x1100, 0x115F},   {0x2E80, 0x303E},   {0x3041, 0xA4CF},
                                                  {0xA960, 0xA97C},   {0xAC00, 0xD7A3},   {0xF900, 0xFAFF},
                                                  {0xFE30, 0xFE6F},   {0xFF00, 0xFF60},   {0xFFE0, 0xFFE6},
                                                  {0x1F300, 0x1F64F}, {0x1F900, 0x1F9FF}, {0x20000, 0x3FFFD}};

template <std::size_t count>
bool isIn(const std::pair<char32_t, char32_t> (&ranges)[count], char32_t code) {
  for (const auto& [first, last] : ranges)
    if (code >= first && code <= last) return true;
  return false;
}

std::size_t columnsOfOne(const Character& character) {
  return isIn(combining, character.code) ? 0 : isIn(wide, character.code) ? 2 : 1;
}

// How many bytes of the front take no more than these columns.
std::size_t frontWithin(std::string_view text, std::size_t columns) {
  std::size_t size = 0;
  for (std::size_t used = 0; size < text.size();) {
    const Character character = frontOf(text.substr(size));
    used += columnsOfOne(character);
    if (used > columns) break;
    size += character.size;
  }
  return size;
}

std::string cut(const std::string& text, std::size_t columns, const std::string& mark) {
  const std::size_t all = std::max(columns, columnsOf(mark)) - columnsOf(mark);
  const std::size_t front = frontWithin(text, all / 2);
  std::string_view back = std::string_view(text).substr(front);
  while (columnsOf(back) > all - all / 2) back.remove_prefix(frontOf(back).size);
  return text.substr(0, front) + mark + std::string(back);
}

// Whether a digit after 0x or 0b is none of 0.
bool hasOnes(std::string_view value) {
  return value.find_first_of("123456789ABCDEF", 2) != value.npos;
}

}  // namespace

std::string printable(std::string_view text) {
  std::string safe;
  for (std::size_t i = 0; i < text.size();) {
    const Character character = frontOf(text.substr(i));
    if ((character.code == 0 && character.size == 1) || isControl(character.code)) {
      for (std::size_t end = i + character.size; i < end; ++i) {
        char code[8];
        std::snprintf(code, sizeof code, "\\x%02X",
                      static_cast<unsigned>(static_cast<unsigned char>(text[i])));
        safe += code;
      }
    } else {
      safe += text.substr(i, character.size);
      i += character.size;
    }
  }
  return safe;
}

std::string counted(std::size_t count, const std::string& what) {
  return std::to_string(count) + " " + what + (count == 1 ? "" : "s");
}

std::size_t columnsOf(std::string_view text) {
  std::size_t columns = 0;
  for (std::size_t i = 0; i < text.size();) {
    const Character character = frontOf(text.substr(i));
    columns += columnsOfOne(character);
    i += character.size;
  }
  return columns;
}

std::string shortened(const std::string& text, std::size_t columns) {
  if (columnsOf(text) <= columns) return text;
  const std::string shorter = cut(text, columns, "…");
  const bool isValue = text.rfind("0x", 0) == 0 || text.rfind("0b", 0) == 0;
  return isValue && hasOnes(text) && !hasOnes(shorter) ? cut(text, columns, "…≠0…") : shorter;
}

}  // namespace qor::tool
