// The frames that a hub receives, and the CRC of both directions.
#pragma once

#include <cstddef>
#include <optional>

#include "sim/Bits.h"

namespace qorsim {

/// A command to one core.
struct Frame {
  unsigned core;
  unsigned code;
  Bits payload;
};

/// The frame in the bits that a hub received since Capture-DR, or none when no frame starts in them, it is
/// cut short or its CRC does not hold. Bits before the frame are constant: it starts with the first step from
/// 1 to 0, and ends with the last bit.
std::optional<Frame> parseFrame(const Bits& received);

/// CRC-16/X-25 of `count` bits, XORed with the low 16 bits of the length of the data among them.
unsigned checksum(const unsigned char* bits, std::size_t count, std::size_t dataLength);

}  // namespace qorsim
