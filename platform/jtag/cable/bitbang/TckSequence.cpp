#include "platform/jtag/cable/bitbang/TckSequence.h"

namespace QorRT {
namespace {

// The walks through the TAP's states, as values of TMS, the first one first.
constexpr std::string_view throughReset = "111110", idleToCaptureIr = "110", idleToCaptureDr = "10",
                           exitToIdle = "10";

}  // namespace

void TckSequence::reset() {
  walk(throughReset);
}

void TckSequence::scanIr(const ChainScan& scan, bool captured) {
  this->scan(idleToCaptureIr, scan, captured);
}

void TckSequence::scanDr(const ChainScan& scan, bool captured) {
  this->scan(idleToCaptureDr, scan, captured);
}

void TckSequence::idle(unsigned cycles) {
  for (unsigned i = 0; i < cycles; ++i) step(false);
}

void TckSequence::step(bool tmsValue, unsigned char rest) {
  tcks_.push_back(static_cast<unsigned char>(rest | (tmsValue ? tms : 0)));
}

void TckSequence::walk(std::string_view tmsValues) {
  for (const char each : tmsValues) step(each == '1');
}

// The TCK after Capture shifts nothing, and leaves out Shift when there are no bits; that of the last bit leaves Shift.
void TckSequence::scan(std::string_view toCapture, const ChainScan& scan, bool captured) {
  walk(toCapture);
  step(scan.bitCount == 0);
  const unsigned char wanted = captured ? capture : 0;
  for (std::size_t i = 0; i < scan.bitCount; ++i)
    step(i + 1 == scan.bitCount, static_cast<unsigned char>((scan.bits[i / 8] >> i % 8 & 1) | wanted));
  if (captured) captureCount_ += scan.bitCount;
  walk(exitToIdle);
}

}  // namespace QorRT
