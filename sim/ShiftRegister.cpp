#include "sim/ShiftRegister.h"

#include <algorithm>

namespace qorsim {

void ShiftRegister::shift(bool in) {
  if (bits_.empty()) return;
  bits_[next_] = in;
  if (++next_ == bits_.size()) next_ = 0;
}

void ShiftRegister::shift(Bits& stream) {
  const std::size_t kept = std::min(bits_.size(), stream.size());
  const auto last = stream.end() - static_cast<std::ptrdiff_t>(kept);
  if (bits_.empty()) std::fill(stream.begin(), stream.end(), static_cast<unsigned char>(0));
  std::swap_ranges(last, stream.end(), bits_.begin());
  std::rotate(stream.begin(), last, stream.end());
}

Bits ShiftRegister::take() const {
  Bits bits = bits_;
  std::rotate(bits.begin(), bits.begin() + static_cast<std::ptrdiff_t>(next_), bits.end());
  return bits;
}

}  // namespace qorsim
