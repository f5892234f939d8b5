// Runs of bits at any place of packed bytes: bit i is bit (i mod 8) of byte i / 8.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace QorRT {

using Qor_Bytes = std::vector<unsigned char>;

inline std::size_t byteCount(std::size_t bitCount) {
  return (bitCount + 7) / 8;
}

/// The `count` (at most 32) bits from bit `at` on.
std::uint32_t bitsAt(const Qor_Bytes& bytes, std::size_t at, std::size_t count);

/// Replaces the `count` (at most 32) bits from bit `at` on by the low ones of `value`.
void putBits(Qor_Bytes& bytes, std::size_t at, std::size_t count, std::uint32_t value);

/// A copy of the `count` bits from bit `at` on; bits beyond them are 0.
Qor_Bytes copyBits(const Qor_Bytes& bytes, std::size_t at, std::size_t count);

/// Replaces the bits from bit `at` on by the whole bytes of `part`.
void placeBytes(Qor_Bytes& bytes, std::size_t at, const Qor_Bytes& part);

/// The place of the first bit that is 1, from bit `at` on; `end` when there is none before that.
std::size_t findOne(const Qor_Bytes& bytes, std::size_t at, std::size_t end);

}  // namespace QorRT
