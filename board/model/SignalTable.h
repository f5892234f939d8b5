// The signals that a user can name.
#pragma once

#include <array>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "QorVIO_Records.h"
#include "board/model/Signal.h"
#include "board/session/Link.h"

namespace qor {

enum class Direction { input, output };

/// What a signals file says, and the whole ports of a core. Names are told apart without regard to the case of A to Z;
/// inputs and outputs are two name spaces.
class SignalTable {
 public:
  std::optional<QOR_CORE_REF> core;  ///< where the file's core stands

  /// Adds a signal; false, adding nothing, when its name is taken in its direction.
  bool add(Signal signal);

  /// Adds the whole ports of a core under the library's names, where they are not taken. select() and fileSignals()
  /// tell them from the signals that were added before.
  void addWholePorts(const QORVIO_CORE_INFO& info);

  /// All signals, in the order in which they were added.
  const std::vector<Signal>& signals() const { return signals_; }

  /// How many, from the front, are not whole ports.
  std::size_t fileSignals() const { return fileSignals_; }

  /// The signal of that name, or a slice of one: "leds[3]", "leds[7:4]" are bits of its value. Throws WrongUse, with
  /// the nearest name there is, when it is not there or the slice is beyond it.
  Signal find(std::string_view name, Direction direction) const;

  /// The named signals; without names all of that direction, whole ports left out when the file names any.
  std::vector<Signal> select(const std::vector<std::string>& names, Direction direction) const;

 private:
  const Signal* exact(std::string_view name, Direction direction) const;
  [[noreturn]] void failUnknown(std::string_view name, Direction direction) const;

  std::vector<Signal> signals_;
  std::size_t fileSignals_ = 0;
  std::array<std::unordered_map<std::string, std::size_t>, 2> places_;  // by direction and folded name
};

/// Reads a signals file. Throws WrongUse, "FILE:LINE: KEY: what is wrong".
SignalTable readSignalFile(const std::string& path);

/// A first signals file for a core: one bit signals for each port, ready to be renamed.
std::string firstSignalFile(QOR_CORE_REF ref, const QORVIO_CORE_INFO& info);

/// Every signal that does not fit the core, one line each; empty when all do.
std::vector<std::string> misfits(const SignalTable& table, const QORVIO_CORE_INFO& info);

/// Width of a port in bits.
unsigned widthOf(const QORVIO_CORE_INFO& info, Port port);

}  // namespace qor
