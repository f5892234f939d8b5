#include "sim/PulseTrains.h"

#include <algorithm>

namespace qorsim {

void PulseTrains::stage(Bits::const_reverse_iterator trains, Bits::const_reverse_iterator mask) {
  const auto width = static_cast<std::ptrdiff_t>(trains_.size());
  if (std::find(mask, mask + width, 1) == mask + width) return;
  nextStep_ = 0;
  for (std::size_t i = 0; i < trains_.size(); ++i, ++mask, trains += steps) {
    unsigned train = 0;
    for (int step = 0; step < steps; ++step)
      train |= unsigned{*mask != 0 ? trains[step] : values_[i]} << step;
    trains_[i] = static_cast<std::uint16_t>(train);
  }
}

void PulseTrains::clock() {
  if (!busy()) return;
  for (std::size_t i = 0; i < trains_.size(); ++i) values_[i] = trains_[i] >> nextStep_ & 1;
  ++nextStep_;
}

}  // namespace qorsim
