// How eight bits, or the two hexadecimal digits of a byte, are written as characters: tables for the loops
// that convert whole ports.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

namespace QorRT {

static_assert(__BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__, "character 0 is the low byte of a loaded word");

/// Eight characters '0' or '1' in one word, character 0 lowest.
using Qor_EightDigits = std::uint64_t;

inline constexpr Qor_EightDigits eightZeros = 0x3030303030303030;
inline constexpr Qor_EightDigits lowBitOfEach = 0x0101010101010101;

/// The byte whose bit 7 is character 0, of a word with a 0 or 1 in each byte.
constexpr unsigned char firstDigitHighest(std::uint64_t bits) {
  return static_cast<unsigned char>(bits * 0x8040201008040201 >> 56);
}

/// The byte whose bit 0 is character 0, of a word with a 0 or 1 in each byte.
constexpr unsigned char firstDigitLowest(std::uint64_t bits) {
  return static_cast<unsigned char>(bits * 0x0102040810204080 >> 56);
}

/// For each byte, its bits as characters: character i is bit i.
constexpr std::array<Qor_EightDigits, 256> makeReverseDigits() {
  std::array<Qor_EightDigits, 256> table{};
  for (unsigned byte = 0; byte < 256; ++byte) {
    table[byte] = eightZeros;
    for (unsigned bit = 0; bit < 8; ++bit) table[byte] |= Qor_EightDigits{byte >> bit & 1} << 8 * bit;
  }
  return table;
}

struct Qor_HexPair {
  char high;
  char low;
};

/// For each byte, its two hexadecimal digits.
constexpr std::array<Qor_HexPair, 256> makeHexPairs() {
  constexpr char digits[] = "0123456789ABCDEF";
  std::array<Qor_HexPair, 256> table{};
  for (unsigned byte = 0; byte < 256; ++byte) table[byte] = {digits[byte >> 4], digits[byte & 15]};
  return table;
}

inline constexpr unsigned char notHex = 0xFF;

/// For each character, the value of the hexadecimal digit, or notHex.
constexpr std::array<unsigned char, 256> makeHexValues() {
  std::array<unsigned char, 256> table{};
  for (unsigned char& value : table) value = notHex;
  for (unsigned char i = 0; i < 10; ++i) table['0' + i] = i;
  for (unsigned char i = 0; i < 6; ++i) {
    table['A' + i] = static_cast<unsigned char>(10 + i);
    table['a' + i] = static_cast<unsigned char>(10 + i);
  }
  return table;
}

inline constexpr auto reverseDigits = makeReverseDigits();
inline constexpr auto hexPairs = makeHexPairs();
inline constexpr auto hexValues = makeHexValues();

}  // namespace QorRT
