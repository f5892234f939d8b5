// Numbers of any width in digits of a base.
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "board/model/Bits.h"

namespace qor {

/// The number in digits of the base (2, 10 or 16), as many bytes as it needs; nothing when a character is no digit, or
/// there is none. Underscores between digits are skipped. Of a number of more than `widest` bits only that it is one:
/// the result has more than `widest` bits, too. The time is linear in the digits, and bounded by `widest` beyond that.
std::optional<Bytes> numberOf(std::string_view digits, unsigned base, unsigned widest);

/// The number in decimal digits.
std::string decimalText(const Bytes& number);

/// How many bits the number needs; 0 for zero.
unsigned bitLength(const Bytes& number);

/// The two's complement in `width` bits.
Bytes negated(Bytes number, unsigned width);

}  // namespace qor
