#include <algorithm>
#include <cstring>
#include <stdexcept>
#include <string>

#include "QorUtil.h"
#include "platform/util/Qor_DigitTables.h"

namespace QorRT {
namespace {

std::uint64_t load8(const char* text) {
  std::uint64_t word;
  std::memcpy(&word, text, 8);
  return word;
}

/// A 1 in each byte that equals '1', a 0 in every other.
std::uint64_t onesAmong(std::uint64_t text) {
  const std::uint64_t bits = text ^ eightZeros;
  if ((bits & ~lowBitOfEach) == 0) return bits;
  constexpr std::uint64_t low7 = 0x7F7F7F7F7F7F7F7F;
  const std::uint64_t difference = bits ^ lowBitOfEach;
  return ~((((difference & low7) + low7) | difference) >> 7) & lowBitOfEach;
}

/// For each character, the four binary digits of the hexadecimal digit, most significant first; 0 for any
/// other character.
constexpr std::array<std::uint32_t, 256> makeHexNibbles() {
  std::array<std::uint32_t, 256> table{};
  for (unsigned c = 0; c < 256; ++c) {
    const unsigned value = hexValues[c];
    if (value == notHex) continue;
    table[c] =
        0x30303030 | (value >> 3 & 1) | (value >> 2 & 1) << 8 | (value >> 1 & 1) << 16 | (value & 1) << 24;
  }
  return table;
}

constexpr auto hexNibbles = makeHexNibbles();

std::uint32_t nibbleOf(char digit) {
  return hexNibbles[static_cast<unsigned char>(digit)];
}

}  // namespace

std::string& Qor_NumberUtil::uInt2DecStr(unsigned value, std::string& out) {
  return out = std::to_string(value);
}

std::string& Qor_NumberUtil::uInt2HexStr(unsigned value, unsigned bitWidth, std::string& out) {
  if (bitWidth < 4 || bitWidth > 32 || bitWidth % 4 != 0) {
    throw std::logic_error("a width of " + std::to_string(bitWidth) + " bits is not 4 to 32 in steps of 4");
  }
  if (std::uint64_t{value} >> bitWidth != 0) {
    throw std::logic_error(std::to_string(value) + " is wider than " + std::to_string(bitWidth) + " bits");
  }
  out.assign(bitWidth / 4, '0');
  for (auto digit = out.rbegin(); value != 0; ++digit, value >>= 4) *digit = hexPairs[value & 15].low;
  return out;
}

std::string& Qor_NumberUtil::binStr2HexStr(const std::string& digits, std::string& out) {
  out.resize((digits.size() + 3) / 4);
  const std::size_t top = digits.size() % 8;
  char padded[9] = "00000000";
  digits.copy(padded + 8 - top, top);
  std::uint64_t bits = load8(padded) ^ eightZeros, seen = bits;
  const Qor_HexPair pair = hexPairs[firstDigitHighest(bits & lowBitOfEach)];
  char* hex = out.data();
  if (top > 4) *hex++ = pair.high;
  if (top > 0) *hex++ = pair.low;
  for (const char *at = digits.data() + top, *end = digits.data() + digits.size(); at != end;
       at += 8, hex += 2) {
    bits = load8(at) ^ eightZeros;
    seen |= bits;
    std::memcpy(hex, &hexPairs[firstDigitHighest(bits & lowBitOfEach)], 2);
  }
  if ((seen & ~lowBitOfEach) != 0) {
    out.clear();
    throw std::logic_error("character " + std::to_string(digits.find_first_not_of("01")) +
                           " of the digit string is not a binary digit");
  }
  return out;
}

std::string& Qor_NumberUtil::hexStr2BinStr(const char* hex, unsigned digitCount, std::string& out) {
  const std::size_t length = std::strlen(hex);
  const std::size_t whole = std::min<std::size_t>(digitCount / 4, length);
  const std::size_t above = length - whole;
  out.resize(digitCount);
  char* digits = out.data() + digitCount - 4 * whole;
  std::fill(out.data(), digits, '0');
  std::uint32_t seen =
      0x30303030;  // a digit's four characters have these bits, the entry of no digit has none
  for (const char* at = hex; at != hex + above; ++at) seen &= nibbleOf(*at);
  if (above != 0) {
    const std::uint32_t nibble = nibbleOf(hex[above - 1]);
    const std::size_t partial = digitCount % 4;
    std::memcpy(digits - partial, reinterpret_cast<const char*>(&nibble) + 4 - partial, partial);
  }
  for (const char* at = hex + above; at != hex + length; ++at, digits += 4) {
    const std::uint32_t nibble = nibbleOf(*at);
    seen &= nibble;
    std::memcpy(digits, &nibble, 4);
  }
  if (seen != 0x30303030) {
    out.clear();
    throw std::logic_error("the text has a character that is not a hexadecimal digit");
  }
  return out;
}

std::string& Qor_NumberUtil::bin2ReverseBinStr(const unsigned char* bytes, unsigned bitCount,
                                               std::string& out) {
  out.resize(bitCount);
  char* digits = out.data();  // known to the loop as a pointer that its writes do not change
  const std::size_t whole = bitCount / 8;
  for (std::size_t i = 0; i < whole; ++i) std::memcpy(digits + 8 * i, &reverseDigits[bytes[i]], 8);
  if (bitCount % 8 != 0) std::memcpy(digits + 8 * whole, &reverseDigits[bytes[whole]], bitCount % 8);
  return out;
}

void Qor_NumberUtil::reverseBinStr2Bin(const std::string& digits, unsigned char* bytes) {
  const std::size_t whole = digits.size() / 8, rest = digits.size() % 8;
  const char* text = digits.data();  // known to the loop as a pointer that its writes do not change
  for (std::size_t i = 0; i < whole; ++i) bytes[i] = firstDigitLowest(onesAmong(load8(text + 8 * i)));
  if (rest == 0) return;
  char padded[9] = "00000000";
  digits.copy(padded, rest, 8 * whole);
  const unsigned kept = bytes[whole] & 0xFFU << rest;
  bytes[whole] = static_cast<unsigned char>(kept | firstDigitLowest(onesAmong(load8(padded))));
}

}  // namespace QorRT
