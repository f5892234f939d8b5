// Slow and obvious models of what runs on the wire. Bits are texts of '0' and '1', the first on the wire
// first.
#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

using Bits = std::string;

inline Bits bitsOf(unsigned value, std::size_t count) {
  Bits bits;
  for (std::size_t i = 0; i < count; ++i) bits += (value >> i & 1) != 0 ? '1' : '0';
  return bits;
}

inline Bits bitsOfHex(const std::string& number, std::size_t count) {
  Bits bits;
  for (auto digit = number.rbegin(); digit != number.rend(); ++digit) {
    bits += bitsOf(static_cast<unsigned>(std::stoul(std::string(1, *digit), nullptr, 16)), 4);
  }
  bits.resize(count, '0');
  return bits;
}

inline std::string hexOf(const Bits& bits) {
  std::string digits;
  for (std::size_t at = 0; at < bits.size(); at += 4) {
    unsigned digit = 0;
    for (std::size_t i = at; i < std::min(at + 4, bits.size()); ++i)
      digit |= (bits[i] == '1' ? 1U : 0U) << (i - at);
    digits.insert(digits.begin(), "0123456789ABCDEF"[digit]);
  }
  return digits;
}

inline Bits bitsOfBytes(const std::vector<unsigned char>& bytes, std::size_t count) {
  Bits bits;
  for (const unsigned char byte : bytes) bits += bitsOf(byte, 8);
  bits.resize(count);
  return bits;
}

inline std::vector<unsigned char> bytesOf(const Bits& bits) {
  std::vector<unsigned char> bytes((bits.size() + 7) / 8);
  for (std::size_t i = 0; i < bits.size(); ++i) {
    if (bits[i] == '1') bytes[i / 8] = static_cast<unsigned char>(bytes[i / 8] | 1U << i % 8);
  }
  return bytes;
}

/// `count` bits that repeat after nothing shorter than 127.
inline Bits noise(std::size_t count, unsigned seed = 1) {
  Bits bits;
  for (unsigned state = seed; bits.size() < count; state = state >> 1 | ((state ^ state >> 1) & 1) << 6) {
    bits += (state & 1) != 0 ? '1' : '0';
  }
  return bits;
}

/// CRC-32 of the bits, as it is sent.
inline Bits crc32Of(const Bits& bits) {
  std::uint32_t crc = 0xFFFFFFFF;
  for (const char bit : bits) crc = ((crc & 1) != 0) != (bit == '1') ? crc >> 1 ^ 0xEDB88320 : crc >> 1;
  return bitsOf(~crc, 32);
}
