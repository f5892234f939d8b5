// The synchronous outputs of a VIO core: one pulse train of 16 steps each.
#pragma once

#include <cstdint>
#include <vector>

#include "SimDesign.h"
#include "sim/Bits.h"

namespace qorsim {

class PulseTrains {
 public:
  static constexpr int steps = 16;

  explicit PulseTrains(unsigned width) : trains_(width), values_(width) {}

  /// Keeps new trains, `steps` digits an output, for the outputs whose mask digit is 1; the others keep their
  /// values. Not while busy().
  void stage(Bits::const_reverse_iterator trains, Bits::const_reverse_iterator mask);

  /// Whether trains wait for the design clock, or their last step is still to come.
  bool busy() const { return nextStep_ < steps; }

  /// One design clock: the next step of the trains, whose last one stays.
  void clock();

  PortBits<const unsigned char> values() const { return {values_.data(), values_.size()}; }

 private:
  std::vector<std::uint16_t> trains_;  // bit 0 is step 0
  Bits values_;
  int nextStep_ = steps;
};

}  // namespace qorsim
