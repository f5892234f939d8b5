#include "board/model/Letters.h"

#include <algorithm>
#include <cstdint>
#include <optional>

namespace qor {
namespace {

struct Range {
  char32_t first, last;
};

// Beyond ASCII: controls, blanks, punctuation, symbols, marks that turn the direction, private use, surrogates.
constexpr Range noLetters[] = {
    {0x80, 0xA9},     {0xAB, 0xB4},     {0xB6, 0xB9},       {0xBB, 0xBF},        {0xD7, 0xD7},
    {0xF7, 0xF7},     {0x61C, 0x61C},   {0x1680, 0x1680},   {0x180E, 0x180E},    {0x2000, 0x2070},
    {0x207A, 0x207E}, {0x208A, 0x208E}, {0x20A0, 0x20CF},   {0x2190, 0x2BFF},    {0x2E00, 0x2E7F},
    {0x3000, 0x3004}, {0x3008, 0x3020}, {0xD800, 0xF8FF},   {0xFDD0, 0xFDEF},    {0xFE00, 0xFE6F},
    {0xFEFF, 0xFEFF}, {0xFFE0, 0xFFFF}, {0x1F000, 0x1FAFF}, {0xE0000, 0x10FFFF},
};

bool isLetter(char32_t code) {
  return std::none_of(std::begin(noLetters), std::end(noLetters),
                      [&](Range each) { return each.first <= code && code <= each.last; });
}

// Takes the first character off the text; nothing when it is no UTF-8.
std::optional<char32_t> takeCharacter(std::string_view& text) {
  const auto first = static_cast<unsigned char>(text.front());
  const std::size_t length = first < 0x80   ? 1
                             : first < 0xC2 ? 0
                             : first < 0xE0 ? 2
                             : first < 0xF0 ? 3
                             : first < 0xF5 ? 4
                                            : 0;
  if (length == 0 || text.size() < length) return std::nullopt;
  char32_t code = length == 1 ? first : first & (0x7FU >> length);
  for (std::size_t i = 1; i < length; ++i) {
    const auto byte = static_cast<unsigned char>(text[i]);
    if ((byte & 0xC0) != 0x80) return std::nullopt;
    code = code << 6 | (byte & 0x3F);
  }
  text.remove_prefix(length);
  return code;
}

template <class Accept>
bool isMadeOf(std::string_view text, Accept accept) {
  while (!text.empty()) {
    const std::optional<char32_t> code = takeCharacter(text);
    if (!code || !accept(*code)) return false;
  }
  return true;
}

bool isAsciiNamePart(char32_t code) {
  return (code >= 'a' && code <= 'z') || (code >= 'A' && code <= 'Z') || (code >= '0' && code <= '9') ||
         code == '_' || code == '-' || code == '/';
}

}  // namespace

bool isSignalName(std::string_view text) {
  return !text.empty() &&
         isMadeOf(text, [](char32_t code) { return code < 0x80 ? isAsciiNamePart(code) : isLetter(code); });
}

bool isNameByte(char letter) {
  const auto byte = static_cast<unsigned char>(letter);
  return byte >= 0x80 || isAsciiNamePart(byte);
}

bool hasControls(std::string_view text) {
  return !isMadeOf(text, [](char32_t code) { return code >= 0x20 && (code < 0x7F || code > 0x9F); });
}

}  // namespace qor
