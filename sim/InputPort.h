// One input port of a VIO core: its pins, and the activity on them.
#pragma once

#include "SimDesign.h"
#include "sim/Bits.h"

namespace qorsim {

/// Activity comes in two kinds. The async kind sees every change and every glitch; the clocked kind, which
/// only a synchronous port has, sees what the design clock samples.
class InputPort {
 public:
  enum class Kind { async, sync };

  InputPort(Kind kind, unsigned width);

  /// What the design may write: values, and marks of glitches since the last clock.
  PortBits<unsigned char> pins() { return {pins_.data(), pins_.size()}; }
  PortBits<unsigned char> glitches() { return {glitches_.data(), glitches_.size()}; }

  /// Takes the pins as they are at power-up, without activity.
  void settle();

  /// Samples the pins and adds to the live activity.
  void clock();

  /// Moves values and live activity to where records() finds them, adding to the activity that is there
  /// (`merge`) or replacing it. No activity is live afterwards.
  void deliver(bool merge);

  /// Appends the delivered records, input 0 first: value, up, down, for a synchronous port clocked up and
  /// clocked down, and a 0.
  void appendRecords(Bits& digits) const;

 private:
  Kind kind_;
  Bits pins_;
  Bits glitches_;
  Bits sampled_;
  Bits live_;       // flags, one element per input
  Bits delivered_;  // flags and the value, one element per input
};

}  // namespace qorsim
