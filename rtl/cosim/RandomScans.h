// Scans such as a host makes, and such as only a broken link or a foreign program makes.
#pragma once

#include <random>

#include "sim/Frame.h"

namespace qorrtl {

class RandomScans {
 public:
  explicit RandomScans(unsigned seed) : random_(seed) {}

  unsigned below(unsigned limit) { return static_cast<unsigned>(random_() % limit); }
  bool oneIn(unsigned count) { return below(count) == 0; }

  qorsim::Bits bits(std::size_t count) {
    qorsim::Bits bits(count);
    for (unsigned char& bit : bits) bit = random_() & 1;
    return bits;
  }

  /// A DR scan: constant pads, filler, and a frame for core 0 or 1 or for none, with a payload of `payloadBits` if
  /// it is a write; now and then something is wrong with it. `padsAfter` constant bits follow.
  qorsim::Bits scan(std::size_t payloadBits, unsigned padsAfter) {
    constexpr unsigned codes[] = {0x0, 0x2, 0x2, 0x2, 0x3, 0x3, 0x3, 0x4, 0x4, 0x4, 0x5, 0xF};
    const unsigned code = oneIn(16) ? below(16) : codes[below(12)];
    std::size_t length = code == 2 ? payloadBits : 0;
    if (oneIn(16)) length = below(static_cast<unsigned>(payloadBits) + 40);
    qorsim::Bits payload = bits(length);
    if (code == 2 && oneIn(4)) std::fill(payload.begin(), payload.end(), static_cast<unsigned char>(0));
    qorsim::appendNumber(payload, oneIn(4) ? below(4) : 0, 4);
    qorsim::appendNumber(payload, code, 4);
    qorsim::appendNumber(payload, qorsim::checksum(payload.data(), payload.size(), length), 16);
    qorsim::Bits scan(below(3), static_cast<unsigned char>(below(2)));
    scan.resize(scan.size() + 1 + (oneIn(2) ? below(700) : below(30)), 1);
    scan.push_back(0);
    scan.insert(scan.end(), payload.begin(), payload.end());
    if (oneIn(16)) scan[below(static_cast<unsigned>(scan.size()))] ^= 1;
    if (oneIn(32)) scan.resize(1 + below(static_cast<unsigned>(scan.size())));
    if (oneIn(64)) scan = bits(1 + below(100));
    scan.resize(scan.size() + padsAfter, static_cast<unsigned char>(below(2)));
    return scan;
  }

  /// TCKs in Run-Test/Idle: none, or as many as the protocol asks for, or more.
  unsigned idleCycles() { return oneIn(4) ? 0 : 8 + (oneIn(4) ? below(20) : 0); }

 private:
  std::mt19937 random_;
};

/// Where a scan rests, or 0 for nowhere.
inline std::size_t pausePoint(RandomScans& random, const qorsim::Bits& scan) {
  return random.oneIn(8) ? 1 + random.below(static_cast<unsigned>(scan.size())) : 0;
}

}  // namespace qorrtl
