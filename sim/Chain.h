// The scan chain of a board and its design clock.
#pragma once

#include <vector>

#include "sim/Tap.h"

namespace qorsim {

/// Every whole scan begins and ends in Run-Test/Idle. The design clock stands still during scans and ticks once for
/// every `tcksPerClock` TCKs of idle(), so that the same steps always give the same bits; with 0 it stands
/// still altogether.
class Chain {
 public:
  explicit Chain(unsigned tcksPerClock) : tcksPerClock_(tcksPerClock) {}

  /// Adds a device at the TDI end: the first one is device 0, nearest to TDO.
  void add(Tap tap);

  /// Test-Logic-Reset of every device.
  void reset();

  /// Every device at once: capture, TCKs that bring a bit from TDI each, update. out() is the bit at TDO.
  /// @{
  void captureIr();
  void captureDr();
  bool out() const { return taps_.front().out(); }
  void shift(bool tdi);
  void updateIr();
  void updateDr();
  /// @}

  /// Scans of the whole chain: replace what goes into TDI by what comes out of TDO.
  void scanIr(Bits& stream);
  void scanDr(Bits& stream);

  /// TCKs in Run-Test/Idle.
  void idle(unsigned cycles);

  /// Counting TCKs begins anew.
  void setTcksPerClock(unsigned tcks);

 private:
  std::vector<Tap> taps_;
  unsigned tcksPerClock_;
  unsigned tcks_ = 0;  // since the last tick
};

}  // namespace qorsim
