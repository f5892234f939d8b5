/// @file
/// What outputs are given in one exchange.
#pragma once

#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "board/Export.h"
#include "board/model/SignalTable.h"
#include "board/model/Value.h"

namespace qor {

/// Values for an output: one of its width, or for a pulse train 16 of them, step 0 first.
struct Assignment {
  Signal signal;
  std::vector<Bytes> steps;
};

/// A bit of a synchronous output that is 1 for `width` steps from step `at` on, and 0 before and after.
struct Pulse {
  unsigned width = 1;
  unsigned at = 0;
};
inline Pulse pulse(unsigned width = 1, unsigned at = 0) {
  return {width, at};
}

/// Up to 16 values of a synchronous output, one per clock of the design; the last one stays.
struct Train {
  std::vector<Value> values;
};

/// An output by name, and what it is given: a number, a text, bits, a Pulse or a Train.
struct Drive {
  template <class What>
  Drive(std::string output, What&& given) : name(std::move(output)), what(std::forward<What>(given)) {}

  std::string name;
  std::variant<Value, Pulse, Train> what;
};

/// Bits for the signals of the table. Throws WrongUse: for an unknown name, one that is given twice, a value that the
/// output cannot have, and a Pulse or Train for an asynchronous output.
QORBOARD_API std::vector<Assignment> assignmentsOf(const std::vector<Drive>& drives,
                                                   const SignalTable& signals);

/// "NAME=VALUE", or "NAME.pulsetrain=V0,V1,...". Throws WrongUse.
QORBOARD_API Drive parseDrive(std::string_view text);

/// One value.
QORBOARD_API Assignment level(const Signal& signal, Bytes value);

/// Throws WrongUse when the signal is not one synchronous output bit, or the pulse does not begin and end within 16 steps,
/// the last of them low.
QORBOARD_API Assignment pulseOf(const Signal& signal, Pulse pulse);

/// Throws WrongUse unless the signal has one bit.
QORBOARD_API void requireBit(const Signal& signal);

}  // namespace qor
