// Eight by eight characters in eight words, turned over at once: how strings of a port are made of strings of its bits,
// and the other way round, without touching every character by itself.
#pragma once

#include <array>
#include <cstdint>
#include <cstring>

namespace QorRT {

#if defined(__BYTE_ORDER__)
static_assert(__BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__, "character 0 is the low byte of a loaded word");
#endif

/// A row of eight characters in each word, character 0 lowest.
using CharBlock = std::array<std::uint64_t, 8>;

inline std::uint64_t loadRow(const char* text) {
  std::uint64_t row;
  std::memcpy(&row, text, sizeof row);
  return row;
}

inline void storeRow(std::uint64_t row, char* text) {
  std::memcpy(text, &row, sizeof row);
}

/// Sixteen bytes, as the compiler keeps them in one vector register.
using Chars = unsigned char __attribute__((vector_size(16)));
using Pairs = std::uint16_t __attribute__((vector_size(16)));
using Quads = std::uint32_t __attribute__((vector_size(16)));
using Rows = std::uint64_t __attribute__((vector_size(16)));

inline Chars inLowHalf(std::uint64_t row) {
  return reinterpret_cast<Chars>(Rows{row, 0});
}

/// Characters of both rows in turn.
inline Pairs interleave(std::uint64_t first, std::uint64_t second) {
  return reinterpret_cast<Pairs>(__builtin_shufflevector(inLowHalf(first), inLowHalf(second), 0, 16, 1, 17, 2,
                                                         18, 3, 19, 4, 20, 5, 21, 6, 22, 7, 23));
}

inline Quads interleaveLow(Pairs first, Pairs second) {
  return reinterpret_cast<Quads>(__builtin_shufflevector(first, second, 0, 8, 1, 9, 2, 10, 3, 11));
}
inline Quads interleaveHigh(Pairs first, Pairs second) {
  return reinterpret_cast<Quads>(__builtin_shufflevector(first, second, 4, 12, 5, 13, 6, 14, 7, 15));
}

inline void storeTwoRows(Quads first, Quads second, CharBlock& rows, unsigned row) {
  const Rows low = reinterpret_cast<Rows>(__builtin_shufflevector(first, second, 0, 4, 1, 5));
  const Rows high = reinterpret_cast<Rows>(__builtin_shufflevector(first, second, 2, 6, 3, 7));
  rows[row] = low[0];
  rows[row + 1] = low[1];
  rows[row + 2] = high[0];
  rows[row + 3] = high[1];
}

/// Character c of row r becomes character r of row c: rows are interleaved by twos, these by twos, and these again.
inline void transpose(CharBlock& rows) {
  const Pairs rows01 = interleave(rows[0], rows[1]);
  const Pairs rows23 = interleave(rows[2], rows[3]);
  const Pairs rows45 = interleave(rows[4], rows[5]);
  const Pairs rows67 = interleave(rows[6], rows[7]);
  storeTwoRows(interleaveLow(rows01, rows23), interleaveLow(rows45, rows67), rows, 0);
  storeTwoRows(interleaveHigh(rows01, rows23), interleaveHigh(rows45, rows67), rows, 4);
}

}  // namespace QorRT
