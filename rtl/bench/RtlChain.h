// The scan chain of a Verilated top, driven at its TAP pins.
#pragma once

#include <functional>

#include "Bits.h"

namespace qorrtl {

/// Every scan begins and ends in Run-Test/Idle. The design clock ticks once for every TCK of idle().
template <class Top>
class RtlChain {
 public:
  /// `ticked` is called after every rising edge of the design clock.
  RtlChain(Top& top, std::function<void()> ticked) : top_(top), ticked_(std::move(ticked)) {
    top_.tck = top_.clk = 0;
    top_.eval();
    for (unsigned i = 0; i < 5; ++i) tck(1, 0);
    tck(0, 0);
  }

  /// Replaces what goes into TDI by what comes out of TDO. `pauseAt` is a bit before which the scan rests in Pause,
  /// or 0.
  /// @{
  void scanIr(qorsim::Bits& stream, std::size_t pauseAt) {
    tck(1, 0);
    scanDr(stream, pauseAt);
  }
  void scanDr(qorsim::Bits& stream, std::size_t pauseAt) {
    for (const unsigned tms : {1, 0, 0}) tck(tms, 0);
    for (std::size_t i = 0; i < stream.size(); ++i) {
      const bool pause = i + 1 == pauseAt;
      const unsigned out = top_.tdo;
      tck(pause || i + 1 == stream.size(), stream[i]);
      if (pause && i + 1 < stream.size())
        for (const unsigned tms : {0, 0, 1, 0}) tck(tms, 1);
      stream[i] = static_cast<unsigned char>(out);
    }
    for (const unsigned tms : {1, 0}) tck(tms, 0);
  }
  /// @}

  void idle(unsigned cycles) {
    for (unsigned i = 0; i < cycles; ++i) {
      tck(0, 0);
      top_.clk = 1;
      top_.eval();
      ticked_();
      top_.clk = 0;
      top_.eval();
    }
  }

 private:
  void tck(unsigned tms, unsigned tdi) {
    top_.tms = tms;
    top_.tdi = tdi;
    for (const unsigned level : {1, 0}) {
      top_.tck = level;
      top_.eval();
    }
  }

  Top& top_;
  std::function<void()> ticked_;
};

}  // namespace qorrtl
