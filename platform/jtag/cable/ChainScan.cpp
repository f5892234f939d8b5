#include "ChainScan.h"

#include <algorithm>

namespace QorRT {
namespace {

using Bytes = std::vector<unsigned char>;

std::size_t byteCount(std::size_t bitCount) {
  return (bitCount + 7) / 8;
}

void clearBeyond(Bytes& bits, std::size_t bitCount) {
  if (bitCount % 8 != 0) bits.back() = static_cast<unsigned char>(bits.back() & ((1u << bitCount % 8) - 1));
}

ChainScan allOnes(std::size_t bitCount) {
  ChainScan scan{Bytes(byteCount(bitCount), 0xFF), bitCount};
  clearBeyond(scan.bits, bitCount);
  return scan;
}

// Replaces the `count` (1 to 8) bits from bit `first` on by the low ones of `value`.
void putBits(Bytes& bits, std::size_t first, unsigned value, std::size_t count) {
  const std::size_t byte = first / 8, shift = first % 8;
  const unsigned mask = ((1u << count) - 1) << shift;
  const unsigned placed = (value << shift) & mask;
  bits[byte] = static_cast<unsigned char>((bits[byte] & ~mask) | placed);
  if (shift + count > 8)
    bits[byte + 1] = static_cast<unsigned char>((bits[byte + 1] & ~(mask >> 8)) | placed >> 8);
}

}  // namespace

ChainScan chainIrScan(const std::vector<Qor_Device>& devices, unsigned device, std::uint64_t opcode) {
  std::size_t total = 0, first = 0;
  for (const Qor_Device& each : devices) {
    if (&each == &devices[device]) first = total;
    total += each.irLength;
  }
  ChainScan scan = allOnes(total);
  for (std::size_t i = 0; i < devices[device].irLength; ++i)
    putBits(scan.bits, first + i, static_cast<unsigned>(opcode >> std::min<std::size_t>(i, 63) & 1), 1);
  return scan;
}

ChainScan chainDrScan(std::size_t deviceCount, unsigned device, const std::vector<unsigned char>& out,
                      std::size_t bitCount) {
  ChainScan scan = allOnes(bitCount + deviceCount - 1);
  for (std::size_t i = 0; i < bitCount; i += 8)
    putBits(scan.bits, device + i, out[i / 8], std::min<std::size_t>(8, bitCount - i));
  return scan;
}

std::vector<unsigned char> chainDrCapture(unsigned device, const std::vector<unsigned char>& tdo,
                                          std::size_t bitCount) {
  Bytes bits(byteCount(bitCount));
  const std::size_t skip = device / 8, shift = device % 8;
  for (std::size_t i = 0; i < bits.size(); ++i) {
    const unsigned low = tdo[skip + i];
    const unsigned high = skip + i + 1 < tdo.size() ? tdo[skip + i + 1] : 0;
    bits[i] = static_cast<unsigned char>((low | high << 8) >> shift);
  }
  clearBeyond(bits, bitCount);
  return bits;
}

}  // namespace QorRT
