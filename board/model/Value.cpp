#include "board/model/Value.h"

#include <algorithm>
#include <cstdio>

#include "board/model/Digits.h"
#include "board/model/Errors.h"

namespace qor {
namespace {

constexpr std::pair<const char*, Radix> radixes[] = {
    {"hex", Radix::hex}, {"bin", Radix::bin}, {"dec", Radix::dec}, {"signed", Radix::signedDec}};

bool isNegative(const Bytes& value, unsigned width) {
  return width != 0 && bitAt(value.data(), width - 1) != 0;
}

void appendHex(std::string& text, const Bytes& value, unsigned width) {
  for (unsigned digit = (width + 3) / 4; digit-- > 0;)
    text += "0123456789ABCDEF"[value[digit / 2] >> 4 * (digit % 2) & 0xF];
}

double asDouble(const Bytes& value, unsigned width, bool isSigned) {
  if (isSigned && isNegative(value, width)) return -asDouble(negated(value, width), width, false);
  double number = 0;
  for (auto byte = value.rbegin(); byte != value.rend(); ++byte) number = number * 256 + *byte;
  return number;
}

std::string scaledText(const Signal& signal, const Bytes& value) {
  char text[40];
  const bool isSigned = signal.radix == Radix::signedDec;
  std::snprintf(text, sizeof text, "%.10g", asDouble(value, signal.width(), isSigned) * signal.scale);
  return signal.unit.empty() ? text : text + (" " + signal.unit);
}

const std::string* enumeratedName(const Signal& signal, const Bytes& value) {
  if (signal.names.empty() || bitLength(value) > 64) return nullptr;
  std::uint64_t number = 0;
  for (auto byte = value.rbegin(); byte != value.rend(); ++byte) number = number << 8 | *byte;
  for (const auto& [name, named] : signal.names)
    if (named == number) return &name;
  return nullptr;
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
};

Spelled spelled(std::string_view text, Radix radix) {
  const bool negative = !text.empty() && text.front() == '-';
  const std::string_view digits = text.substr(negative ? 1 : 0);
  const std::string_view prefix = digits.substr(0, 2), rest = digits.substr(prefix.size());
  if (prefix == "0x" || prefix == "0X") return {rest, 16, negative};
  // 0b1 and 0d1 are digits of a hexadecimal number too: the prefix wins.
  if (prefix == "0b" || prefix == "0B") return {rest, 2, negative};
  if (prefix == "0d" || prefix == "0D") return {rest, 10, negative};
  if (negative || radix == Radix::dec || radix == Radix::signedDec) return {digits, 10, negative};
  return {digits, radix == Radix::bin ? 2U : 16U, negative};
}

}  // namespace

void extract(const Signal& signal, const Bytes& portImage, Bytes& value) {
  if (signal.width() == 1) {
    value.resize(1);
    value[0] = static_cast<unsigned char>(bitAt(portImage.data(), signal.bits[0]));
    return;
  }
  value.assign((signal.width() + 7) / 8, 0);
  for (unsigned i = 0; i < signal.width(); ++i)
    value[i / 8] =
        static_cast<unsigned char>(value[i / 8] | bitAt(portImage.data(), signal.bits[i]) << i % 8);
}

void appendDigits(std::string& text, const Bytes& value, unsigned width, Radix radix) {
  switch (radix) {
    case Radix::hex:
      appendHex(text, value, width);
      break;
    case Radix::bin:
      for (unsigned bit = width; bit-- > 0;) text += static_cast<char>('0' + bitAt(value.data(), bit));
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
  if (radix == nullptr) {
    if (const std::string* name = enumeratedName(signal, value)) {
      text += *name;
      return;
    }
    if (signal.scale != 0) {
      text += scaledText(signal, value);
      return;
    }
  }
  const Radix used = radix != nullptr ? *radix : signal.radix;
  text += used == Radix::hex ? "0x" : used == Radix::bin ? "0b" : "";
  appendDigits(text, value, signal.width(), used);
}

std::string shown(const Signal& signal, const Bytes& value, const Radix* radix) {
  std::string text;
  appendShown(text, signal, value, radix);
  return text;
}

Bytes parseValue(const Signal& signal, std::string_view text) {
  const std::size_t byteCount = (signal.width() + 7) / 8;
  for (const auto& [name, number] : signal.names) {
    if (name != text) continue;
    Bytes value = *numberOf(std::to_string(number), 10);
    value.resize(byteCount);
    return value;
  }
  const Spelled parts = spelled(text, signal.radix);
  std::optional<Bytes> number = numberOf(parts.digits, parts.base);
  if (!number) failText(signal, text);
  if (bitLength(*number) > signal.width()) failWidth(signal, text);
  number->resize(byteCount);
  if (!parts.isNegative) {
    // In a signed radix the top bit is the sign, unless the value was spelled bit by bit.
    if (signal.radix == Radix::signedDec && parts.base == 10 && isNegative(*number, signal.width()))
      failWidth(signal, text);
    return *number;
  }
  Bytes value = negated(*number, signal.width());
  if (bitLength(value) != 0 && !isNegative(value, signal.width())) failWidth(signal, text);
  return value;
}

std::string hexText(const Bytes& value, unsigned width) {
  std::string text;
  appendHex(text, value, width);
  return text;
}

Radix radixNamed(std::string_view text) {
  for (const auto& [name, radix] : radixes)
    if (name == text) return radix;
  throw WrongUse("not a radix (hex, bin, dec, signed): " + std::string(text));
}

const char* radixName(Radix radix) {
  return radixes[static_cast<unsigned>(radix)].first;
}

}  // namespace qor
