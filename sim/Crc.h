// The CRC of both directions of a scan.
#pragma once

#include "sim/Bits.h"

namespace qorsim {

/// CRC-32 of IEEE 802.3, over bits in the order of the wire.
class Crc {
 public:
  void add(const Bits& bits);

  /// As it is sent, bit 0 first.
  std::uint32_t value() const { return ~register_; }

 private:
  std::uint32_t register_ = 0xFFFFFFFF;
};

}  // namespace qorsim
