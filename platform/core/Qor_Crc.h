// The check sequence of frames and answers.
#pragma once

#include <cstddef>

namespace QorRT {

/// CRC-16/X-25 (reflected polynomial 0x8408, start 0xFFFF, complemented) of the first `bitCount` bits, bit 0
/// of byte 0 first.
unsigned crc16(const unsigned char* bytes, std::size_t bitCount) noexcept;

}  // namespace QorRT
