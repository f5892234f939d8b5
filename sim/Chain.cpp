#include "sim/Chain.h"

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
  for (auto tap = taps_.rbegin(); tap != taps_.rend(); ++tap) {
    const bool out = tap->out();
    tap->shift(tdi);
    tdi = out;
  }
}

void Chain::updateIr() {
  for (Tap& tap : taps_) tap.updateIr();
}

void Chain::updateDr() {
  for (Tap& tap : taps_) tap.updateDr();
}

void Chain::scanIr(Bits& stream) {
  for (auto tap = taps_.rbegin(); tap != taps_.rend(); ++tap) tap->scanIr(stream);
}

void Chain::scanDr(Bits& stream) {
  for (auto tap = taps_.rbegin(); tap != taps_.rend(); ++tap) tap->scanDr(stream);
}

void Chain::idle(unsigned cycles) {
  if (tcksPerClock_ == 0) return;
  for (unsigned i = 0; i < cycles; ++i) {
    if (++tcks_ < tcksPerClock_) continue;
    tcks_ = 0;
    for (Tap& tap : taps_) tap.clock();
  }
}

void Chain::setTcksPerClock(unsigned tcks) {
  tcksPerClock_ = tcks;
  tcks_ = 0;
}

}  // namespace qorsim
