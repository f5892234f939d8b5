#include "sim/Frame.h"

namespace qorsim {
namespace {

constexpr std::size_t addressBits = 4;
constexpr std::size_t codeBits = 4;
constexpr std::size_t crcBits = 16;
constexpr std::size_t tailBits = addressBits + codeBits + crcBits;

// The position after the first step from 1 to 0, or the end. The line counts as 0 before the first bit.
std::size_t afterFirstFall(const Bits& received) {
  for (std::size_t i = 1; i < received.size(); ++i)
    if (received[i - 1] == 1 && received[i] == 0) return i + 1;
  return received.size();
}

}  // namespace

std::optional<Frame> parseFrame(const Bits& received) {
  const std::size_t start = afterFirstFall(received);
  if (received.size() - start < tailBits) return std::nullopt;
  const std::size_t payloadLength = received.size() - start - tailBits;
  const unsigned char* payload = received.data() + start;
  const unsigned char* address = payload + payloadLength;
  const unsigned char* code = address + addressBits;
  const unsigned char* crc = code + codeBits;
  if (numberAt(crc, crcBits) != checksum(payload, payloadLength + addressBits + codeBits, payloadLength))
    return std::nullopt;
  return Frame{numberAt(address, addressBits), numberAt(code, codeBits), Bits(payload, address)};
}

unsigned checksum(const unsigned char* bits, std::size_t count, std::size_t dataLength) {
  unsigned crc = 0xFFFF;
  for (std::size_t i = 0; i < count; ++i) {
    const bool feedback = ((crc ^ bits[i]) & 1) != 0;
    crc = feedback ? crc >> 1 ^ 0x8408 : crc >> 1;
  }
  return (crc ^ 0xFFFF ^ static_cast<unsigned>(dataLength)) & 0xFFFF;
}

}  // namespace qorsim
