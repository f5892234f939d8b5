// Scans such as a host makes, and such as only a broken link or other software makes.
#pragma once

#include <algorithm>
#include <random>

#include "rtl/cosim/Frames.h"

namespace qorrtl {

struct RandomScan {
  qorsim::Bits bits;
  std::size_t headerEnd, frameEnd;  // bits, if nothing is wrong with it

  /// Whether one of them ended in the last TCKs, or may end in the next ones.
  bool endsBefore(std::size_t bit) const {
    const auto near = [bit](std::size_t end) { return bit + 4 >= end && bit < end + 20; };
    return near(headerEnd) || near(frameEnd);
  }
};

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

  /// A DR scan: constant bits, a frame for core 0 or 1 or for none, with a payload of `payloadBits` if it is a write,
  /// and room for the answer to it or to a read of `recordBits`; now and then something is wrong with it.
  RandomScan scan(std::size_t payloadBits, std::size_t recordBits) {
    const unsigned core = oneIn(4) ? below(4) : 0;
    const unsigned code = codeOf();
    const bool writes = (code & 7) == 2;
    qorsim::Bits payload = bits(oneIn(24) ? below(static_cast<unsigned>(payloadBits) + 40) : payloadBits);
    if (oneIn(4)) std::fill(payload.begin(), payload.end(), static_cast<unsigned char>(0));
    const unsigned tag = tagFor(code);
    const Frame frame =
        writes && !oneIn(24) ? writeFrame(code, core, tag, payload) : headerFrame(code, core, tag);
    qorsim::Bits bits(below(3), static_cast<unsigned char>(below(2)));
    const std::size_t before = bits.size();
    bits.insert(bits.end(), frame.bits.begin(), frame.bits.end());
    const std::size_t answer = std::max<std::size_t>(128, recordBits) + 80;
    bits.resize(bits.size() + (oneIn(4) ? below(static_cast<unsigned>(answer)) : answer), 1);
    return {damaged(std::move(bits)), before + headerEnd, before + frame.bits.size()};
  }

  /// TCKs in Run-Test/Idle.
  unsigned idleCycles() { return oneIn(2) ? 0 : below(60); }

 private:
  unsigned codeOf() {
    constexpr unsigned codes[] = {0x0, 0x2, 0x2, 0x2, 0xA, 0xA, 0x3, 0x3, 0x3, 0xB, 0xB, 0x5, 0x5, 0xD, 0xF};
    return oneIn(24) ? below(16) : codes[below(15)];
  }

  // Few tags, so that repeats meet their first attempts; now and then of another host, or 0.
  unsigned tagFor(unsigned code) {
    if (oneIn(16)) return oneIn(2) ? below(0x10000) : below(2) << 4;
    if ((code & 8) == 0 || oneIn(4)) tag_ = 0x1230 + below(4);
    return tag_;
  }

  qorsim::Bits damaged(qorsim::Bits scan) {
    const auto anywhere = [&] { return below(static_cast<unsigned>(scan.size())); };
    if (oneIn(16)) scan[anywhere()] ^= 1;
    if (oneIn(32)) scan.erase(scan.begin() + anywhere());
    if (oneIn(32)) scan.insert(scan.begin() + anywhere(), static_cast<unsigned char>(below(2)));
    if (oneIn(24)) scan.resize(1 + anywhere());
    if (oneIn(32)) return bits(1 + below(300));
    return scan;
  }

  std::mt19937 random_;
  unsigned tag_ = 0x1230;
};

/// Where a scan rests, or 0 for nowhere.
inline std::size_t pausePoint(RandomScans& random, const qorsim::Bits& scan) {
  return random.oneIn(8) ? 1 + random.below(static_cast<unsigned>(scan.size())) : 0;
}

}  // namespace qorrtl
