/// @file
/// The signals that a user can name.
#pragma once

#include <array>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "QorVIO_Records.h"
#include "board/Export.h"
#include "board/model/Signal.h"

namespace qor {

enum class Direction { input, output };

/// What a signals file says, and the whole ports of its cores. Names are compared without regard to the case of A to Z;
/// inputs and outputs are two name spaces.
class QORBOARD_API SignalTable {
 public:
  /// `file` is where the signals are from, for messages.
  /// @{
  SignalTable() = default;
  explicit SignalTable(std::string file) : file_(std::move(file)) {}
  /// @}

  const std::string& file() const { return file_; }

  /// The cores whose bits the signals are: `Signal::core` counts in it. Empty when no core was named: then all signals
  /// are of one core.
  const std::vector<QOR_CORE_REF>& cores() const { return cores_; }

  /// The number of that core, which is added when it is not there.
  std::size_t addCore(QOR_CORE_REF ref);

  /// Puts another core in the place of the first one, or of none.
  void setFirstCore(QOR_CORE_REF ref);

  /// Adds a signal; false, adding nothing, when its name is taken in its direction.
  bool add(Signal signal);

  /// Adds the whole ports of a core under the library's names, where they are not taken; those of any core but the first
  /// with the core's address before them, "1.1.0/async_in_data". select() and fileSignals() leave them out.
  void addWholePorts(const QORVIO_CORE_INFO& info, std::size_t core = 0);

  /// All signals, in the order in which they were added.
  const std::vector<Signal>& signals() const { return signals_; }

  /// How many, from the front, are not whole ports.
  std::size_t fileSignals() const { return fileSignals_; }

  /// The signal of that name, or a slice of one: "leds[3]", "leds[7:4]" are bits of its value, without a sign. Throws
  /// UnknownSignal, with the nearest name there is, and WrongUse when the slice is beyond the signal.
  Signal find(std::string_view name, Direction direction) const;

  /// The named signals; without names all of that direction, whole ports left out when the file names any.
  std::vector<Signal> select(const std::vector<std::string>& names, Direction direction) const;

 private:
  const Signal* exact(std::string_view name, Direction direction) const;
  [[noreturn]] void failUnknown(std::string_view name, Direction direction) const;

  std::string file_ = "signals";
  std::vector<QOR_CORE_REF> cores_;
  std::vector<Signal> signals_;
  std::size_t fileSignals_ = 0;
  std::array<std::unordered_map<std::string, std::size_t>, 2> places_;  // by direction and folded name
};

/// Every signal of the file that does not fit its core, one line each; empty when all do. One element of `infos` a core.
QORBOARD_API std::vector<std::string> signalsOutsideCore(const SignalTable& table,
                                                         const std::vector<QORVIO_CORE_INFO>& infos);

}  // namespace qor
