#include "platform/core/Qor_Bits.h"

namespace QorRT {

std::uint32_t bitsAt(const Qor_Bytes& bytes, std::size_t at, std::size_t count) {
  std::uint64_t word = 0;
  for (std::size_t i = byteCount(at + count); i-- > at / 8;) word = word << 8 | bytes[i];
  return static_cast<std::uint32_t>(word >> at % 8 & ((std::uint64_t{1} << count) - 1));
}

void putBits(Qor_Bytes& bytes, std::size_t at, std::size_t count, std::uint32_t value) {
  std::uint64_t mask = ((std::uint64_t{1} << count) - 1) << at % 8;
  std::uint64_t word = std::uint64_t{value} << at % 8 & mask;
  for (std::size_t i = at / 8; mask != 0; ++i, mask >>= 8, word >>= 8)
    bytes[i] = static_cast<unsigned char>((bytes[i] & ~mask) | (word & 0xFF));
}

Qor_Bytes copyBits(const Qor_Bytes& bytes, std::size_t at, std::size_t count) {
  Qor_Bytes copy(byteCount(count));
  const std::size_t first = at / 8, shift = at % 8;
  for (std::size_t i = 0; i < copy.size(); ++i) {
    const unsigned above = first + i + 1 < bytes.size() ? bytes[first + i + 1] : 0;
    copy[i] = static_cast<unsigned char>((bytes[first + i] | above << 8) >> shift);
  }
  if (count % 8 != 0) copy.back() &= static_cast<unsigned char>((1U << count % 8) - 1);
  return copy;
}

void placeBytes(Qor_Bytes& bytes, std::size_t at, const Qor_Bytes& part) {
  const std::size_t shift = at % 8;
  std::size_t index = at / 8;
  unsigned carry = bytes[index] & ((1U << shift) - 1);
  for (const unsigned char byte : part) {
    carry |= static_cast<unsigned>(byte) << shift;
    bytes[index++] = static_cast<unsigned char>(carry);
    carry >>= 8;
  }
  putBits(bytes, index * 8, shift, carry);
}

std::size_t findOne(const Qor_Bytes& bytes, std::size_t at, std::size_t end) {
  for (; at < end; ++at) {
    if (at % 8 == 0 && bytes[at / 8] == 0)
      at += 7;
    else if ((bytes[at / 8] >> at % 8 & 1) != 0)
      return at;
  }
  return end;
}

}  // namespace QorRT
