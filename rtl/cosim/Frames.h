// Frames to a hub, bit by bit, and the CRC of both directions.
#pragma once

#include "sim/Bits.h"

namespace qorrtl {

constexpr std::size_t crcBits = 32, headBits = 8;
constexpr std::size_t headerEnd = 2 + 24 + crcBits;  // bits of a frame without a payload

/// CRC-32 (IEEE 802.3) of bits that come in several pieces.
class Crc {
 public:
  template <class Bits>
  Crc& add(const Bits& bits) {
    for (const unsigned char bit : bits) state_ = state_ >> 1 ^ (((state_ ^ bit) & 1) != 0 ? 0xEDB88320u : 0);
    return *this;
  }
  std::uint32_t value() const { return ~state_; }

 private:
  std::uint32_t state_ = 0xFFFFFFFF;
};

struct Frame {
  qorsim::Bits bits;  // with the start
  Crc crc;            // over header and payload
};

/// Without a payload: `headerEnd` bits.
inline Frame headerFrame(unsigned code, unsigned core, unsigned tag) {
  qorsim::Bits header;
  qorsim::appendNumber(header, code | core << 4 | tag << 8, 24);
  Frame frame;
  frame.bits.reserve(headerEnd);
  qorsim::appendNumber(frame.bits, 1, 2);
  frame.bits.insert(frame.bits.end(), header.begin(), header.end());
  qorsim::appendNumber(frame.bits, frame.crc.add(header).value(), crcBits);
  return frame;
}

inline Frame writeFrame(unsigned code, unsigned core, unsigned tag, const qorsim::Bits& payload) {
  Frame frame = headerFrame(code, core, tag);
  frame.bits.insert(frame.bits.end(), payload.begin(), payload.end());
  qorsim::appendNumber(frame.bits, frame.crc.add(payload).value(), crcBits);
  return frame;
}

}  // namespace qorrtl
