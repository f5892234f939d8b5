#include "sim/InputPort.h"

#include <algorithm>

namespace qorsim {
namespace {

// The bits of an element, in the order of the digits of a record.
constexpr unsigned value = 1, up = 2, down = 4, clockedUp = 8, clockedDown = 16;

unsigned activity(unsigned before, unsigned now, bool glitch) {
  const unsigned change = before == now ? 0 : now != 0 ? up | clockedUp : down | clockedDown;
  return glitch ? change | up | down : change;
}

}  // namespace

InputPort::InputPort(Kind kind, unsigned width)
    : kind_(kind), pins_(width), glitches_(width), sampled_(width), live_(width), delivered_(width) {}

void InputPort::settle() {
  std::transform(pins_.begin(), pins_.end(), sampled_.begin(), [](unsigned char pin) { return pin != 0; });
  std::fill(glitches_.begin(), glitches_.end(), static_cast<unsigned char>(0));
}

void InputPort::clock() {
  for (std::size_t i = 0; i < pins_.size(); ++i) {
    const unsigned now = pins_[i] != 0;
    live_[i] = static_cast<unsigned char>(live_[i] | activity(sampled_[i], now, glitches_[i] != 0));
    sampled_[i] = static_cast<unsigned char>(now);
    glitches_[i] = 0;
  }
}

void InputPort::deliver(bool merge) {
  for (std::size_t i = 0; i < live_.size(); ++i) {
    const unsigned kept = merge ? delivered_[i] & ~value : 0;
    delivered_[i] = static_cast<unsigned char>(kept | live_[i] | sampled_[i]);
    live_[i] = 0;
  }
}

void InputPort::appendRecords(Bits& digits) const {
  const unsigned flags = kind_ == Kind::sync ? 5 : 3;
  for (const unsigned char element : delivered_) {
    appendNumber(digits, element, flags);
    digits.push_back(0);
  }
}

}  // namespace qorsim
