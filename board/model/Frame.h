/// @file
/// What the inputs of a board were, and what moved, at one poll.
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "board/Export.h"
#include "board/model/Sample.h"
#include "board/model/SignalTable.h"
#include "board/model/Value.h"

namespace qor {

/// One input of a frame: its value, and whether it moved since the frame before.
class QORBOARD_API Reading {
 public:
  Reading(Signal signal, const Sample& sample);

  const Signal& signal() const { return signal_; }

  /// The value's bits.
  const Bytes& bits() const { return value_; }

  /// The value as a number, unsigned. Throws WrongUse when it does not fit 64 bits.
  std::uint64_t number() const;
  /// The same with the top bit as the sign, where the signal's radix is signedDec.
  std::int64_t signedNumber() const;

  /// In the signal's unit; without a scale the number itself.
  double scaled() const;

  /// The name of the value, if it has one.
  std::optional<std::string> name() const;

  /// As people see it: name, number with unit, or digits.
  std::string text() const { return shown(signal_, value_); }

  /// Whether any bit went from 0 to 1, from 1 to 0, or either, however short.
  /// @{
  bool rose() const { return activity_.up; }
  bool fell() const { return activity_.down; }
  bool moved() const { return activity_.up || activity_.down; }
  /// @}

  /// The same as the design's clock saw it; false for an asynchronous input.
  /// @{
  bool syncRose() const { return activity_.syncUp; }
  bool syncFell() const { return activity_.syncDown; }
  /// @}

  /// Which bits of the value rose and fell.
  /// @{
  const Bytes& upBits() const { return up_; }
  const Bytes& downBits() const { return down_; }
  /// @}

  /// Whether the value is this one. Throws WrongUse for a value that the signal cannot have.
  /// @{
  bool is(const Value& value) const { return value.bitsFor(signal_) == value_; }
  friend bool operator==(const Reading& reading, const Value& value) { return reading.is(value); }
  friend bool operator!=(const Reading& reading, const Value& value) { return !reading.is(value); }
  /// @}

 private:
  Signal signal_;
  Bytes value_, up_, down_;
  Activity activity_;
};

/// One snapshot per core, and its activity since the frame before. Independent of the board that it came from.
class QORBOARD_API Frame {
 public:
  /// `samples` has one element per core of the table.
  Frame(std::shared_ptr<const SignalTable> signals, std::vector<Sample> samples)
      : signals_(std::move(signals)), samples_(std::move(samples)) {}

  /// An input by name, a slice of one too. Throws as SignalTable::find() does.
  Reading operator[](std::string_view name) const;
  Reading operator[](const Signal& signal) const { return {signal, samples_.at(signal.core)}; }

  const SignalTable& signals() const { return *signals_; }
  const std::vector<Sample>& samples() const { return samples_; }

 private:
  std::shared_ptr<const SignalTable> signals_;
  std::vector<Sample> samples_;
};

}  // namespace qor
