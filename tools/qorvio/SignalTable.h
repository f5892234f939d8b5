// The signals that a user can name.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Link.h"
#include "QorVIO_Records.h"
#include "Signal.h"

namespace tool {

enum class Direction { input, output };

/// What a signals file says. Names are told apart without regard to case; inputs and outputs are two name spaces.
struct SignalTable {
  std::optional<QOR_CORE_REF> core;  ///< where the file's core stands
  std::vector<Signal> signals;       ///< in the file's order

  /// Adds the whole ports of a core under the library's names, where they are not taken.
  void addWholePorts(const QORVIO_CORE_INFO& info);

  /// The signal of that name, or a slice of one: "leds[3]", "leds[7:4]" are bits of its value. Throws WrongUse, with
  /// the nearest name there is, when it is not there or the slice is beyond it.
  Signal find(std::string_view name, Direction direction) const;

  /// The named signals; all in that direction, whole ports left out when the file names any, when `names` is empty.
  std::vector<Signal> select(const std::vector<std::string>& names, Direction direction) const;

  std::size_t fileSignals = 0;  ///< how many, from the front, are the file's own
};

/// Reads a signals file. Throws WrongUse, "FILE:LINE: KEY: what is wrong".
SignalTable readSignalFile(const std::string& path);

/// A first signals file for a core: one bit signals for each port, ready to be renamed.
std::string firstSignalFile(QOR_CORE_REF ref, const QORVIO_CORE_INFO& info);

/// Every signal that does not fit the core, one line each; empty when all do.
std::vector<std::string> misfits(const SignalTable& table, const QORVIO_CORE_INFO& info);

/// Width of a port in bits.
unsigned widthOf(const QORVIO_CORE_INFO& info, Port port);

}  // namespace tool
