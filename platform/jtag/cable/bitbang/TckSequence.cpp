#include "platform/jtag/cable/bitbang/TckSequence.h"

namespace QorRT {

void TckSequence::reset() {
  walk(tmsReset);
  walk(tmsPath(state_, TapState::runTestIdle));
}

void TckSequence::scanIr(const ChainScan& scan, bool captured) {
  this->scan(TapState::captureIr, scan, captured);
}

void TckSequence::scanDr(const ChainScan& scan, bool captured) {
  this->scan(TapState::captureDr, scan, captured);
}

void TckSequence::idle(unsigned cycles) {
  for (unsigned i = 0; i < cycles; ++i) step(false);
}

void TckSequence::step(bool tmsValue, unsigned char rest) {
  tcks_.push_back(static_cast<unsigned char>(rest | (tmsValue ? tms : 0)));
  state_ = nextState(state_, tmsValue);
}

void TckSequence::walk(TmsPath path) {
  for (unsigned i = 0; i < path.count; ++i) step((path.bits >> i & 1) != 0);
}

// The TCK after Capture shifts nothing; the TCK of the last bit leaves Shift.
void TckSequence::scan(TapState captureState, const ChainScan& scan, bool captured) {
  walk(tmsPath(state_, captureState));
  if (scan.bitCount != 0) step(false);
  const unsigned char wanted = captured ? capture : 0;
  for (std::size_t i = 0; i < scan.bitCount; ++i)
    step(i + 1 == scan.bitCount, static_cast<unsigned char>((scan.bits[i / 8] >> i % 8 & 1) | wanted));
  if (captured) captureCount_ += scan.bitCount;
  walk(tmsPath(state_, TapState::runTestIdle));
}

}  // namespace QorRT
