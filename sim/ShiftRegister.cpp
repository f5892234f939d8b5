#include "sim/ShiftRegister.h"

#include <algorithm>

namespace qorsim {

bool ShiftRegister::out() const {
  if (position_ < bits_.size()) return bits_[position_] != 0;
  return passing_ && bits_[0] != 0;
}

void ShiftRegister::shift(bool in) {
  if (position_ == bits_.size()) {
    if (passing_)
      position_ = 0;
    else
      bits_.push_back(0);
  }
  bits_[position_++] = in;
}

void ShiftRegister::shift(Bits& stream) {
  if (!passing_) {
    bits_.resize(stream.size());
    bits_.swap(stream);
    position_ = bits_.size();
    return;
  }
  position_ = std::min(bits_.size(), stream.size());
  const auto last = stream.end() - static_cast<std::ptrdiff_t>(position_);
  std::swap_ranges(last, stream.end(), bits_.begin());
  std::rotate(stream.begin(), last, stream.end());
}

Bits ShiftRegister::take() {
  if (passing_)
    std::rotate(bits_.begin(), bits_.begin() + static_cast<std::ptrdiff_t>(position_), bits_.end());
  else
    bits_.resize(position_);
  position_ = 0;
  return std::move(bits_);
}

}  // namespace qorsim
