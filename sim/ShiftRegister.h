// What stands between TDI and TDO of one device, from capture to update.
#pragma once

#include <utility>

#include "sim/Bits.h"

namespace qorsim {

/// Bits are in the order in which they come out.
class ShiftRegister {
 public:
  /// Of a fixed length of at least 1, that of `captured`: what goes in comes out behind it.
  static ShiftRegister passing(Bits captured) { return {std::move(captured), true}; }

  /// Of no length of its own: zeros come out behind what was captured, and all that goes in is kept.
  static ShiftRegister keeping(Bits captured) { return {std::move(captured), false}; }

  /// The bit at its TDO end.
  bool out() const;

  /// One TCK.
  void shift(bool in);

  /// As many TCKs as the stream has bits, the first since capture: replaces what goes in by what comes out.
  void shift(Bits& stream);

  /// What an update takes: the bits that it holds, or, when it keeps them, all that went in.
  Bits take();

 private:
  ShiftRegister(Bits captured, bool passing) : bits_(std::move(captured)), passing_(passing) {}

  // From `position_` on what comes out next; before it what went in, in the places that became free.
  Bits bits_;
  std::size_t position_ = 0;
  bool passing_;
};

}  // namespace qorsim
