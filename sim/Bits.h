// Bits in the order in which they pass on the wire, one element (0 or 1) a bit.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace qorsim {

using Bits = std::vector<unsigned char>;

/// Appends the low `count` bits of a number, least significant first.
void appendNumber(Bits& bits, std::uint32_t value, unsigned count);

/// The same as bits of their own.
Bits bitsOf(std::uint32_t value, unsigned count);

/// The number that `count` (at most 32) bits spell, least significant first.
std::uint32_t numberAt(const unsigned char* first, std::size_t count);

/// From and to little-endian bytes: bit i is bit (i mod 8) of byte i / 8.
Bits unpack(const std::vector<unsigned char>& bytes, std::size_t bitCount);
std::vector<unsigned char> pack(const Bits& bits);

}  // namespace qorsim
