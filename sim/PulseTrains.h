// The synchronous outputs of a VIO core: one pulse train of 16 steps each.
#pragma once

#include <cstdint>
#include <vector>

#include "SimDesign.h"
#include "sim/Bits.h"

namespace qorsim {

class PulseTrains {
 public:
  static constexpr unsigned steps = 16;

  explicit PulseTrains(unsigned width);

  /// Keeps new trains, `steps` digits an output, for the outputs whose mask digit is 1. Nothing may be
  /// pending.
  void stage(Bits::const_reverse_iterator trains, Bits::const_reverse_iterator mask);

  /// Whether staged trains wait for the design clock.
  bool pending() const { return pending_; }

  /// One design clock: staged trains begin with their step 0; all others go on by one step and hold the last.
  void clock();

  PortBits<const unsigned char> values() const { return {values_.data(), values_.size()}; }

 private:
  std::vector<std::uint16_t> running_;  // bit 0 is the step that is out now
  std::vector<std::uint16_t> staged_;   // bit 0 is step 0
  Bits mask_;
  Bits values_;
  bool pending_ = false;
};

}  // namespace qorsim
