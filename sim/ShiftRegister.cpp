#include "sim/ShiftRegister.h"

#include <algorithm>

namespace qorsim {

void ShiftRegister::shift(bool in) {
  if (bits_.empty()) return;
  bits_[next_] = in;
  if (++next_ == bits_.size()) next_ = 0;
}

Bits ShiftRegister::take() const {
  Bits bits = bits_;
  std::rotate(bits.begin(), bits.begin() + static_cast<std::ptrdiff_t>(next_), bits.end());
  return bits;
}

}  // namespace qorsim
