/// @file
/// Values of signals: given as numbers, texts or bits, and shown as people read them.
///
/// Conventions
///
///  1. A value is a little-endian bit array of its signal's width; bits above the width are 0.
///  2. Of a signal with a scale a plain number is in its unit ("3.5", 3.5, "3.5 dB"); it becomes the nearest step. Without
///     a scale it is the number that the bits make.
///  3. After 0x, 0b and 0d the digits are the bits themselves, whatever the scale.
#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <type_traits>
#include <variant>

#include "board/Export.h"
#include "board/model/Bits.h"
#include "board/model/Signal.h"

namespace qor {

/// A value as a host gives it, before it is known for which signal.
class QORBOARD_API Value {
 public:
  /// A number, signed or not; in the signal's unit where it has a scale.
  template <class Whole, std::enable_if_t<std::is_integral_v<Whole>, int> = 0>
  Value(Whole number) : value_(widest(number)) {}
  Value(double number) : value_(number) {}

  /// As parseValue() takes it.
  /// @{
  Value(const char* text) : value_(std::string(text)) {}
  Value(std::string text) : value_(std::move(text)) {}
  /// @}

  /// The bits.
  Value(Bytes bits) : value_(std::move(bits)) {}

  /// The bits for this signal. Throws WrongUse for a value that the signal cannot have.
  Bytes bitsFor(const Signal& signal) const;

  /// A number that is compared in steps of the signal's scale, which it may lie between: nothing for names and bits.
  std::optional<double> stepsFor(const Signal& signal) const;

  /// As it was given.
  std::string text() const;

 private:
  template <class Whole>
  static auto widest(Whole number) {
    if constexpr (std::is_signed_v<Whole>) return static_cast<std::int64_t>(number);
    if constexpr (!std::is_signed_v<Whole>) return static_cast<std::uint64_t>(number);
  }

  std::variant<std::int64_t, std::uint64_t, double, std::string, Bytes> value_;
};

/// Reads a value: an enumerated name; 0x, 0b or 0d and digits; a number, in the unit where the signal has a scale; else
/// digits in the signal's radix. The unit may follow. Throws WrongUse for a text that is none of these, and for a value
/// that is too wide, with the width.
QORBOARD_API Bytes parseValue(const Signal& signal, std::string_view text);

/// Whether the text can be read as a number without regard to a radix: no name for a value, then.
bool isNumber(std::string_view text);

/// As people see it: the enumerated name if there is one, else scaled, else the digits with the prefix of the radix (0x,
/// 0b, none); with the unit. `radix` overrides the signal's own, enumeration, scale and unit when it is not null.
/// @{
QORBOARD_API std::string shown(const Signal& signal, const Bytes& value, const Radix* radix = nullptr);
QORBOARD_API void appendShown(std::string& text, const Signal& signal, const Bytes& value,
                              const Radix* radix = nullptr);
/// @}

/// Appends the value's digits in the radix: hexadecimal and binary with all leading zeros.
QORBOARD_API void appendDigits(std::string& text, const Bytes& value, unsigned width, Radix radix);

/// Upper-case hexadecimal digits, ceil(width / 4) of them, as the library takes them.
QORBOARD_API std::string hexText(const Bytes& value, unsigned width);

/// The enumerated name of the value; null when it has none.
QORBOARD_API const std::string* enumeratedName(const Signal& signal, const Bytes& value);

/// The number that the bits make, as near as a double is; below 0 where the signal's top bit is a sign.
QORBOARD_API double numberIn(const Signal& signal, const Bytes& value);

}  // namespace qor
