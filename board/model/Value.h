// Values of signals: taken out of port images, shown as text, and read from text.
//
// A value is a little-endian bit array: bit i is bit (i mod 8) of byte i / 8; bits above the width are 0.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "board/model/Signal.h"

namespace qor {

using Bytes = std::vector<unsigned char>;

inline unsigned bitAt(const unsigned char* bits, unsigned index) {
  return bits[index / 8] >> index % 8 & 1u;
}
inline void setBit(Bytes& bits, unsigned index, unsigned value) {
  const auto mask = static_cast<unsigned char>(1u << index % 8);
  bits[index / 8] = static_cast<unsigned char>(value != 0 ? bits[index / 8] | mask : bits[index / 8] & ~mask);
}

/// The signal's value, out of an image of its port, into `value`, whose memory is used again.
void extract(const Signal& signal, const Bytes& portImage, Bytes& value);

/// Appends the value's digits in the radix: hexadecimal and binary with all leading zeros.
void appendDigits(std::string& text, const Bytes& value, unsigned width, Radix radix);

/// As people see it: the enumerated name if there is one, else scaled with its unit, else the digits with the prefix
/// of the radix (0x, 0b, none). `radix` overrides the signal's own, enumeration and scale when it is not null.
std::string shown(const Signal& signal, const Bytes& value, const Radix* radix = nullptr);
void appendShown(std::string& text, const Signal& signal, const Bytes& value, const Radix* radix = nullptr);

/// Reads a value: an enumerated name, 0x, 0b, a decimal number behind 0d or with a minus sign, or else digits in the
/// signal's radix. Throws WrongUse for a text that is none of these, and for a value that is too wide, with its width.
Bytes parseValue(const Signal& signal, std::string_view text);

/// Upper-case hexadecimal digits, ceil(width / 4) of them, as the library takes them.
std::string hexText(const Bytes& value, unsigned width);

/// "hex", "bin", "dec" or "signed". Throws WrongUse.
Radix radixNamed(std::string_view text);
const char* radixName(Radix radix);

}  // namespace qor
