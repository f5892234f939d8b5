#include "sim/Chain.h"

#include <algorithm>
#include <utility>

namespace qorsim {

void Chain::add(Tap tap) {
  taps_.push_back(std::move(tap));
}

void Chain::reset() {
  for (Tap& tap : taps_) tap.reset();
}

void Chain::captureIr() {
  for (Tap& tap : taps_) tap.captureIr();
}

void Chain::captureDr() {
  for (Tap& tap : taps_) tap.captureDr();
}

void Chain::shift(bool tdi) {
  const bool passes = leavesTime();
  for (auto tap = taps_.rbegin(); tap != taps_.rend(); ++tap) {
    const bool out = tap->out();
    tap->shift(tdi);
    tdi = out;
  }
  if (passes) passTck();
}

void Chain::updateIr() {
  for (Tap& tap : taps_) tap.updateIr();
}

void Chain::settle() {
  for (Tap& tap : taps_) tap.settle();
}

void Chain::scanIr(Bits& stream) {
  captureIr();
  shiftAll(stream);
  updateIr();
}

void Chain::scanDr(Bits& stream) {
  captureDr();
  shiftAll(stream);
  settle();
}

void Chain::idle(unsigned cycles) {
  for (unsigned i = 0; i < cycles; ++i) passTck();
}

void Chain::setTcksPerClock(unsigned tcks) {
  tcksPerClock_ = tcks;
  tcks_ = 0;
}

// Device by device, unless a clock that one hub asks for could be early for another.
void Chain::shiftAll(Bits& stream) {
  if (std::count_if(taps_.begin(), taps_.end(), [](const Tap& tap) { return tap.isSelected(); }) > 1)
    return shiftEach(stream);
  for (auto tap = taps_.rbegin(); tap != taps_.rend(); ++tap) tap->shift(stream, [this] { passTck(); });
}

void Chain::shiftEach(Bits& stream) {
  for (unsigned char& bit : stream) {
    const bool in = bit != 0;
    bit = out();
    shift(in);
  }
}

bool Chain::leavesTime() const {
  return std::any_of(taps_.begin(), taps_.end(), [](const Tap& tap) { return tap.leavesTime(); });
}

void Chain::passTck() {
  if (tcksPerClock_ == 0 || ++tcks_ < tcksPerClock_) return;
  tcks_ = 0;
  for (Tap& tap : taps_) tap.clock();
}

}  // namespace qorsim
