// The scan chain of a board and its design clock.
#pragma once

#include <vector>

#include "sim/Tap.h"

namespace qorsim {

/// The design clock ticks once for every `tcksPerClock` TCKs in Run-Test/Idle, and in Shift-DR from the end of a
/// frame to the bit of the answer that ends the wait, so that the same steps always give the same bits, and wide
/// cores cost no more clocks than narrow ones. With 0 it stops.
class Chain {
 public:
  explicit Chain(unsigned tcksPerClock) : tcksPerClock_(tcksPerClock) {}

  /// Adds a device at the TDI end: the first one is device 0, nearest to TDO.
  void add(Tap tap);

  const Tap& tap(unsigned device) const { return taps_[device]; }

  /// Test-Logic-Reset of every device.
  void reset();

  /// A TCK of every device in each of these states.
  /// @{
  void captureIr();
  void captureDr();
  void shift(bool tdi);
  void updateIr();
  /// @}

  /// A TCK in any other state, in which something that a scan began may still happen.
  void settle();

  /// The bit at TDO.
  bool out() const { return taps_.front().out(); }

  /// Scans of the whole chain from Run-Test/Idle and back: replace what goes into TDI by what comes out of TDO.
  /// @{
  void scanIr(Bits& stream);
  void scanDr(Bits& stream);
  /// @}

  /// TCKs in Run-Test/Idle.
  void idle(unsigned cycles);

  /// Counting TCKs begins anew.
  void setTcksPerClock(unsigned tcks);

 private:
  void shiftAll(Bits& stream);
  void shiftEach(Bits& stream);
  bool leavesTime() const;
  void passTck();

  std::vector<Tap> taps_;
  unsigned tcksPerClock_;
  unsigned tcks_ = 0;  // since the last tick
};

}  // namespace qorsim
