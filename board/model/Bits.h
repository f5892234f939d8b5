/// @file
/// Rows of bits as the engine keeps them: little-endian arrays, bit i is bit (i mod 8) of byte i / 8. Bits of the last
/// byte above the width are 0.
#pragma once

#include <cstddef>
#include <vector>

namespace qor {

using Bytes = std::vector<unsigned char>;

/// How many bytes so many bits take.
constexpr std::size_t byteCount(unsigned width) {
  return (std::size_t{width} + 7) / 8;
}

inline unsigned bitAt(const unsigned char* bits, unsigned index) {
  return bits[index / 8] >> index % 8 & 1u;
}
inline unsigned bitAt(const Bytes& bits, unsigned index) {
  return bitAt(bits.data(), index);
}

inline void setBit(unsigned char* bits, unsigned index, unsigned value) {
  const auto mask = static_cast<unsigned char>(1u << index % 8);
  bits[index / 8] = static_cast<unsigned char>(value != 0 ? bits[index / 8] | mask : bits[index / 8] & ~mask);
}
inline void setBit(Bytes& bits, unsigned index, unsigned value) {
  setBit(bits.data(), index, value);
}

}  // namespace qor
