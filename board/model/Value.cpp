#include "board/model/Value.h"

#include <algorithm>
#include <charconv>
#include <cmath>

#include "board/model/Digits.h"
#include "board/model/Errors.h"

namespace qor {
namespace {

bool isNegative(const Bytes& value, unsigned width) {
  return width != 0 && bitAt(value, width - 1) != 0;
}

[[noreturn]] void failWidth(const Signal& signal, std::string_view text) {
  throw WrongUse(signal.name + " has " + std::to_string(signal.width()) +
                 (signal.width() == 1 ? " bit" : " bits") + ", too few for the value: " + std::string(text));
}

[[noreturn]] void failText(const Signal& signal, std::string_view text) {
  std::string names;
  for (const auto& each : signal.names) names += (names.empty() ? ", nor one of " : " ") + each.first;
  throw WrongUse("not a value for " + signal.name + ", whose radix is " + radixName(signal.radix) + names +
                 ": " + std::string(text));
}

struct Spelled {
  std::string_view digits;
  unsigned base;
  bool isNegative;
  bool isPrefixed;
};

// With base 0 where the radix decides.
Spelled spelled(std::string_view text) {
  const bool negative = !text.empty() && text.front() == '-';
  const std::string_view digits = text.substr(negative ? 1 : 0);
  const std::string_view prefix = digits.substr(0, 2), rest = digits.substr(prefix.size());
  if (prefix == "0x" || prefix == "0X") return {rest, 16, negative, true};
  // 0b1 and 0d1 are digits of a hexadecimal number too: the prefix wins.
  if (prefix == "0b" || prefix == "0B") return {rest, 2, negative, true};
  if (prefix == "0d" || prefix == "0D") return {rest, 10, negative, true};
  return {digits, negative ? 10U : 0U, negative, false};
}

unsigned baseOf(Radix radix) {
  return radix == Radix::hex ? 16 : radix == Radix::bin ? 2 : 10;
}

// The bits of a number with that magnitude. Of a signed signal the top bit is the sign, unless the bits were spelled.
Bytes fitted(const Signal& signal, Bytes magnitude, bool isBelowZero, bool isSpelled, std::string_view text) {
  if (bitLength(magnitude) > signal.width()) failWidth(signal, text);
  magnitude.resize(byteCount(signal.width()));
  if (isBelowZero) {
    Bytes value = negated(std::move(magnitude), signal.width());
    if (bitLength(value) != 0 && !isNegative(value, signal.width())) failWidth(signal, text);
    return value;
  }
  if (signal.radix == Radix::signedDec && !isSpelled && isNegative(magnitude, signal.width()))
    failWidth(signal, text);
  return magnitude;
}

// The bytes of a whole number from 0 on.
Bytes bytesOf(double number) {
  Bytes bytes;
  while (number >= 1) {
    bytes.push_back(static_cast<unsigned char>(std::fmod(number, 256)));
    number = std::floor(number / 256);
  }
  return bytes;
}

// A number in the unit as steps of the scale: whole where it is a step but for rounding.
double stepsOf(const Signal& signal, double number) {
  constexpr double rounding = 1e-9;
  const double steps = number / signal.scale, whole = std::round(steps);
  return std::fabs(steps - whole) <= rounding * std::fmax(1, std::fabs(steps)) ? whole : steps;
}

Bytes bitsOfNumber(const Signal& signal, double number, std::string_view text) {
  const double steps = signal.scale != 0 ? std::round(stepsOf(signal, number)) : number;
  if (!std::isfinite(steps) || steps != std::round(steps)) failText(signal, text);
  return fitted(signal, bytesOf(std::fabs(steps)), steps < 0, false, text);
}

std::string numberText(double number) {
  char text[40];
  // 0.0 is added so that no zero has a sign.
  const auto end = std::to_chars(text, text + sizeof text, number + 0.0, std::chars_format::general, 10).ptr;
  return {text, end};
}

void appendUnit(std::string& text, const Signal& signal) {
  if (!signal.unit.empty()) text.append(" ").append(signal.unit);
}

std::string_view withoutUnit(const Signal& signal, std::string_view text) {
  const std::size_t unit = signal.unit.size();
  if (unit == 0 || text.size() <= unit || text.substr(text.size() - unit) != signal.unit) return text;
  text.remove_suffix(unit);
  return text.substr(0, text.find_last_not_of(' ') + 1);
}

// "3.5", "3.5dB" or "3.5 dB" for a signal with that unit.
bool parseScaled(const Signal& signal, std::string_view text, double& number) {
  text = withoutUnit(signal, text);
  const auto [rest, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  return error == std::errc() && rest == text.data() + text.size() && std::isfinite(number);
}

void appendHex(std::string& text, const Bytes& value, unsigned width) {
  for (unsigned digit = (width + 3) / 4; digit-- > 0;)
    text += "0123456789ABCDEF"[value[digit / 2] >> 4 * (digit % 2) & 0xF];
}

}  // namespace

Bytes Value::bitsFor(const Signal& signal) const {
  if (const auto* text = std::get_if<std::string>(&value_)) return parseValue(signal, *text);
  if (const auto* number = std::get_if<double>(&value_)) return bitsOfNumber(signal, *number, text());
  if (const auto* bits = std::get_if<Bytes>(&value_)) return fitted(signal, *bits, false, true, text());
  const auto* negative = std::get_if<std::int64_t>(&value_);
  const bool isBelowZero = negative != nullptr && *negative < 0;
  const std::uint64_t number = negative == nullptr ? std::get<std::uint64_t>(value_)
                               : isBelowZero       ? ~static_cast<std::uint64_t>(*negative) + 1
                                                   : static_cast<std::uint64_t>(*negative);
  if (signal.scale != 0)
    return bitsOfNumber(signal, static_cast<double>(number) * (isBelowZero ? -1 : 1), text());
  Bytes magnitude;
  for (unsigned shift = 0; shift < 64; shift += 8)
    magnitude.push_back(static_cast<unsigned char>(number >> shift));
  return fitted(signal, std::move(magnitude), isBelowZero, false, text());
}

std::optional<double> Value::stepsFor(const Signal& signal) const {
  double number = 0;
  if (const auto* text = std::get_if<std::string>(&value_)) {
    const bool isName = std::any_of(signal.names.begin(), signal.names.end(),
                                    [&](const auto& each) { return each.first == *text; });
    if (signal.scale == 0 || isName || !parseScaled(signal, *text, number)) return std::nullopt;
  } else if (const auto* real = std::get_if<double>(&value_)) {
    number = *real;
  } else if (signal.scale == 0 || std::holds_alternative<Bytes>(value_)) {
    return std::nullopt;
  } else {
    const auto* whole = std::get_if<std::int64_t>(&value_);
    number =
        whole != nullptr ? static_cast<double>(*whole) : static_cast<double>(std::get<std::uint64_t>(value_));
  }
  return signal.scale != 0 ? stepsOf(signal, number) : number;
}

std::string Value::text() const {
  if (const auto* text = std::get_if<std::string>(&value_)) return *text;
  if (const auto* number = std::get_if<double>(&value_)) return numberText(*number);
  if (const auto* bits = std::get_if<Bytes>(&value_))
    return "0x" + hexText(*bits, static_cast<unsigned>(8 * bits->size()));
  if (const auto* number = std::get_if<std::int64_t>(&value_)) return std::to_string(*number);
  return std::to_string(std::get<std::uint64_t>(value_));
}

Bytes parseValue(const Signal& signal, std::string_view text) {
  for (const auto& [name, number] : signal.names)
    if (name == text) return Value(number).bitsFor({signal.name, signal.port, signal.bits});
  const Spelled parts = spelled(withoutUnit(signal, text));
  double scaled = 0;
  if (signal.scale != 0 && !parts.isPrefixed) {
    if (!parseScaled(signal, text, scaled)) failText(signal, text);
    return bitsOfNumber(signal, scaled, text);
  }
  const unsigned base = parts.base != 0 ? parts.base : baseOf(signal.radix);
  std::optional<Bytes> number = numberOf(parts.digits, base, signal.width());
  if (!number) failText(signal, text);
  return fitted(signal, std::move(*number), parts.isNegative, base != 10, text);
}

bool isNumber(std::string_view text) {
  const Spelled parts = spelled(text);
  return numberOf(parts.digits, parts.base != 0 ? parts.base : 10, 64).has_value();
}

double numberIn(const Signal& signal, const Bytes& value) {
  const bool isBelowZero = signal.radix == Radix::signedDec && isNegative(value, signal.width());
  const Bytes magnitude = isBelowZero ? negated(value, signal.width()) : value;
  double number = 0;
  for (auto byte = magnitude.rbegin(); byte != magnitude.rend(); ++byte) number = number * 256 + *byte;
  return isBelowZero ? -number : number;
}

const std::string* enumeratedName(const Signal& signal, const Bytes& value) {
  if (signal.names.empty() || bitLength(value) > 64) return nullptr;
  std::uint64_t number = 0;
  for (auto byte = value.rbegin(); byte != value.rend(); ++byte) number = number << 8 | *byte;
  for (const auto& [name, named] : signal.names)
    if (named == number) return &name;
  return nullptr;
}

void appendDigits(std::string& text, const Bytes& value, unsigned width, Radix radix) {
  switch (radix) {
    case Radix::hex:
      appendHex(text, value, width);
      break;
    case Radix::bin:
      for (unsigned bit = width; bit-- > 0;) text += static_cast<char>('0' + bitAt(value, bit));
      break;
    case Radix::signedDec:
      text += isNegative(value, width) ? "-" + decimalText(negated(value, width)) : decimalText(value);
      break;
    case Radix::dec:
      text += decimalText(value);
      break;
  }
}

void appendShown(std::string& text, const Signal& signal, const Bytes& value, const Radix* radix) {
  const std::string* const name = radix == nullptr ? enumeratedName(signal, value) : nullptr;
  if (name != nullptr) {
    text += *name;
    return;
  }
  const Radix used = radix != nullptr ? *radix : signal.radix;
  if (radix == nullptr && signal.scale != 0) {
    text += numberText(numberIn(signal, value) * signal.scale);
  } else {
    text += used == Radix::hex ? "0x" : used == Radix::bin ? "0b" : "";
    appendDigits(text, value, signal.width(), used);
  }
  if (radix == nullptr) appendUnit(text, signal);
}

std::string shown(const Signal& signal, const Bytes& value, const Radix* radix) {
  std::string text;
  appendShown(text, signal, value, radix);
  return text;
}

std::string hexText(const Bytes& value, unsigned width) {
  std::string text;
  appendHex(text, value, width);
  return text;
}

}  // namespace qor
