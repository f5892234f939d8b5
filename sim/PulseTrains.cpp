#include "sim/PulseTrains.h"

#include <iterator>

namespace qorsim {

PulseTrains::PulseTrains(unsigned width) : running_(width), staged_(width), mask_(width), values_(width) {}

void PulseTrains::stage(Bits::const_reverse_iterator trains, Bits::const_reverse_iterator mask) {
  for (std::size_t i = 0; i < mask_.size(); ++i) {
    unsigned train = 0;
    for (unsigned step = 0; step < steps; ++step) train |= unsigned{*trains++} << step;
    staged_[i] = static_cast<std::uint16_t>(train);
    mask_[i] = *mask++;
    pending_ = pending_ || mask_[i] != 0;
  }
}

void PulseTrains::clock() {
  for (std::size_t i = 0; i < running_.size(); ++i) {
    const unsigned train = running_[i];
    const unsigned next = train >> 1 | (train & 1u << (steps - 1));
    running_[i] = pending_ && mask_[i] != 0 ? staged_[i] : static_cast<std::uint16_t>(next);
    values_[i] = running_[i] & 1;
  }
  pending_ = false;
}

}  // namespace qorsim
