// A chain in C++ and one in Verilog that get the same bits and the same design clocks.
#pragma once

#include "rtl/cosim/PinsChain.h"
#include "rtl/cosim/RandomScans.h"
#include "rtl/cosim/RtlPins.h"
#include "sim/Chain.h"

namespace qorrtl {

/// Whatever a core in C++ does in its design clock n, that in Verilog does in clock n + 2, and its synchronisers take
/// two TCKs to say so. So the clocks come where that makes no difference: after a frame there are more of them than
/// TCKs, so that both have done what they were asked when the head of the answer has left; others come after the scan.
template <class Model>
class LockStep {
 public:
  LockStep(qorsim::Chain& sim, RtlPins<Model>& pins) : sim_(sim), pins_(pins), rtl_(stopped(pins)) {
    sim_.setTcksPerClock(0);
  }

  /// False when a bit of TDO differs. `pauseAt` as in PinsChain.
  /// @{
  bool scanIr(const qorsim::Bits& bits, std::size_t pauseAt) {
    qorsim::Bits expected = bits, actual = bits;
    sim_.scanIr(expected);
    rtl_.scanIr(actual, pauseAt);
    return actual == expected;
  }
  bool scanDr(const RandomScan& scan, std::size_t pauseAt) {
    qorsim::Bits expected = scan.bits, actual = scan.bits;
    sim_.captureDr();
    rtl_.scanDr(actual, pauseAt, [&](std::size_t i) {
      expected[i] = sim_.out();
      sim_.shift(scan.bits[i] != 0);
      if (scan.endsBefore(i)) clocks(3);
    });
    sim_.settle();
    return actual == expected;
  }
  /// @}

  void idle(unsigned cycles) { rtl_.idle(cycles); }

  void clocks(unsigned count) {
    sim_.setTcksPerClock(1);
    for (unsigned i = 0; i < count; ++i) {
      sim_.idle(1);
      pins_.tickOnce();
    }
    sim_.setTcksPerClock(0);
  }

 private:
  static RtlPins<Model>& stopped(RtlPins<Model>& pins) {
    pins.stopClock();
    return pins;
  }

  qorsim::Chain& sim_;
  RtlPins<Model>& pins_;
  PinsChain rtl_;
};

}  // namespace qorrtl
