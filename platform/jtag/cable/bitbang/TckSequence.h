// Scans of a whole chain, written out TCK by TCK.
#pragma once

#include <cstddef>
#include <string_view>
#include <vector>

#include "ChainScan.h"

namespace QorRT {

/// Grows at its end. It begins in Run-Test/Idle, and each of its steps ends there.
class TckSequence {
 public:
  /// The bits of one TCK: TDI and TMS at its rising edge, and whether TDO is wanted there.
  static constexpr unsigned char tdi = 1, tms = 2, capture = 4;

  /// Test-Logic-Reset from wherever the chain is, then Run-Test/Idle.
  void reset();

  /// A scan through Capture, Shift and Update. `captured` asks for TDO, one bit per bit.
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
  void walk(std::string_view tmsValues);
  void scan(std::string_view toCapture, const ChainScan& scan, bool captured);

  std::vector<unsigned char> tcks_;
  std::size_t captureCount_ = 0;
};

}  // namespace QorRT
