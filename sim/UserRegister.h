// A hub, and how late its device's user register passes TDI to it and TDO from it.
#pragma once

#include "sim/Hub.h"

namespace qorsim {

/// TCKs from a bit at the pin to the bit at the hub, and from the hub to the pin: 0 to 2.
struct Lateness {
  static constexpr unsigned most = 2;

  unsigned tdi = 0;
  unsigned tdo = 0;
};

class UserRegister {
 public:
  explicit UserRegister(Lateness lateness) : lateness_(lateness) {}

  Hub hub;

  /// A TCK in Capture-DR. Zeros are under way to the hub and from it.
  void capture() {
    hub.capture();
    in_ = 0;
    out_ = hub.out();
  }

  /// The bit at its TDO end.
  bool out() const { return (out_ >> lateness_.tdo & 1) != 0; }

  /// A TCK in Shift-DR.
  void shift(bool in) {
    in_ = in_ << 1 | unsigned{in};
    hub.shift((in_ >> lateness_.tdi & 1) != 0);
    out_ = out_ << 1 | unsigned{hub.out()};
  }

  /// As many such TCKs as only shift, at most `count`: replaces what goes in by what comes out. A shortcut for shift().
  std::size_t shiftRun(unsigned char* bits, std::size_t count) {
    if (lateness_.tdi != 0 || lateness_.tdo != 0) return 0;
    const std::size_t run = hub.shiftRun(bits, count);
    out_ = unsigned{hub.out()};
    return run;
  }

 private:
  Lateness lateness_;
  unsigned in_ = 0;  // bit 0 is the bit that came last
  unsigned out_ = 0;
};

}  // namespace qorsim
