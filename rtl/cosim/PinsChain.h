// Scans of a chain by its wires, with rests in Pause as no cable makes them.
#pragma once

#include <functional>

#include "Pins.h"
#include "sim/Bits.h"

namespace qorrtl {

/// Every scan begins and ends in Run-Test/Idle. `pins` must outlive it.
class PinsChain {
 public:
  explicit PinsChain(qorsim::Pins& pins) : pins_(pins) {
    for (unsigned i = 0; i < 5; ++i) tck(true, false);
    tck(false, false);
  }

  /// Replaces what goes into TDI by what comes out of TDO. `pauseAt` is a bit before which the scan rests in Pause,
  /// or 0; `afterBit` is called after each TCK that shifts.
  /// @{
  void scanIr(qorsim::Bits& stream, std::size_t pauseAt) {
    tck(true, false);
    scanDr(stream, pauseAt);
  }
  void scanDr(
      qorsim::Bits& stream, std::size_t pauseAt,
      const std::function<void(std::size_t)>& afterBit = [](std::size_t) {}) {
    for (const bool tms : {true, false, false}) tck(tms, false);
    for (std::size_t i = 0; i < stream.size(); ++i) {
      const bool pause = i + 1 == pauseAt;
      const bool out = pins_.tdo();
      tck(pause || i + 1 == stream.size(), stream[i] != 0);
      afterBit(i);
      if (pause && i + 1 < stream.size())
        for (const bool tms : {false, false, true, false}) tck(tms, true);
      stream[i] = out ? 1 : 0;
    }
    for (const bool tms : {true, false}) tck(tms, false);
  }
  /// @}

  void idle(unsigned cycles) {
    for (unsigned i = 0; i < cycles; ++i) tck(false, false);
  }

 private:
  // Leaves TCK low, where TDO shows what the next TCK will sample.
  void tck(bool tms, bool tdi) {
    pins_.write(true, tms, tdi);
    pins_.write(false, tms, tdi);
  }

  qorsim::Pins& pins_;
};

}  // namespace qorrtl
