// The check sequence of frames and answers.
#pragma once

#include <cstddef>
#include <cstdint>

namespace QorRT {

/// CRC-32 (reflected polynomial 0xEDB88320, start 0xFFFFFFFF, complemented) of bits that arrive in parts.
class Qor_Crc32 {
 public:
  /// Adds the first `bitCount` bits, bit 0 of byte 0 first.
  void add(const unsigned char* bytes, std::size_t bitCount) noexcept;

  /// The CRC of all bits so far, its bit 0 the first on the wire.
  std::uint32_t value() const noexcept { return ~register_; }

 private:
  std::uint32_t register_ = 0xFFFFFFFF;
};

}  // namespace QorRT
