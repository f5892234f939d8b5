// Scans of a whole chain, written out TCK by TCK.
#pragma once

#include <cstddef>
#include <vector>

#include "ChainScan.h"
#include "platform/jtag/cable/bitbang/TapState.h"

namespace QorRT {

/// Grows at its end, and knows in which state its last TCK leaves the chain. It begins in Run-Test/Idle.
class TckSequence {
 public:
  /// The bits of one TCK: TDI and TMS at its rising edge, and whether TDO is wanted there.
  static constexpr unsigned char tdi = 1, tms = 2, capture = 4;

  /// Test-Logic-Reset from wherever the chain is, then Run-Test/Idle.
  void reset();

  /// A scan through Capture, Shift and Update, back to Run-Test/Idle. `captured` asks for TDO, one bit a bit.
  /// @{
  void scanIr(const ChainScan& scan, bool captured = false);
  void scanDr(const ChainScan& scan, bool captured);
  /// @}

  /// TCKs in Run-Test/Idle.
  void idle(unsigned cycles);

  const std::vector<unsigned char>& tcks() const { return tcks_; }
  std::size_t captureCount() const { return captureCount_; }

 private:
  void step(bool tmsValue, unsigned char rest = tdi);
  void walk(TmsPath path);
  void scan(TapState captureState, const ChainScan& scan, bool captured);

  TapState state_ = TapState::runTestIdle;
  std::vector<unsigned char> tcks_;
  std::size_t captureCount_ = 0;
};

}  // namespace QorRT
