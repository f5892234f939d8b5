#include "sim/Bits.h"

namespace qorsim {

void appendNumber(Bits& bits, std::uint32_t value, unsigned count) {
  for (unsigned i = 0; i < count; ++i) bits.push_back(value >> i & 1);
}

Bits bitsOf(std::uint32_t value, unsigned count) {
  Bits bits;
  bits.reserve(count);
  appendNumber(bits, value, count);
  return bits;
}

std::uint32_t numberAt(const unsigned char* first, std::size_t count) {
  std::uint32_t value = 0;
  for (std::size_t i = 0; i < count; ++i) value |= std::uint32_t{first[i]} << i;
  return value;
}

Bits unpack(const std::vector<unsigned char>& bytes, std::size_t bitCount) {
  Bits bits(bitCount);
  for (std::size_t i = 0; i < bitCount; ++i) bits[i] = bytes[i / 8] >> i % 8 & 1;
  return bits;
}

std::vector<unsigned char> pack(const Bits& bits) {
  std::vector<unsigned char> bytes((bits.size() + 7) / 8);
  for (std::size_t i = 0; i < bits.size(); ++i)
    bytes[i / 8] = static_cast<unsigned char>(bytes[i / 8] | bits[i] << i % 8);
  return bytes;
}

}  // namespace qorsim
