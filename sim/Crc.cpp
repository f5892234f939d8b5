#include "sim/Crc.h"

namespace qorsim {

void Crc::add(const Bits& bits) {
  for (const unsigned char bit : bits) {
    const std::uint32_t feedback = 0u - ((register_ ^ bit) & 1);
    register_ = register_ >> 1 ^ (feedback & 0xEDB88320);
  }
}

}  // namespace qorsim
