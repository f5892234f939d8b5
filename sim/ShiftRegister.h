// What is between TDI and TDO of one device that has no user register selected.
#pragma once

#include <utility>

#include "sim/Bits.h"

namespace qorsim {

/// Of the length of what was captured: what goes in comes out after it. Without any bits it delivers zeros.
class ShiftRegister {
 public:
  /// Bits in the order in which they come out.
  explicit ShiftRegister(Bits captured) : bits_(std::move(captured)) {}

  /// The bit at its TDO end.
  bool out() const { return !bits_.empty() && bits_[next_] != 0; }

  /// One TCK.
  void shift(bool in);

  /// As many TCKs as the stream has bits, the first since capture: replaces what goes in by what comes out. An update may
  /// follow only a stream that is no shorter than the register.
  void shift(Bits& stream);

  /// The bits that an update takes.
  Bits take() const;

 private:
  Bits bits_;             // a ring
  std::size_t next_ = 0;  // the place of the bit that comes out next
};

}  // namespace qorsim
