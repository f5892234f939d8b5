// Numbers of any width in digits of a base.
#pragma once

#include <optional>
#include <string_view>

#include "board/model/Value.h"

namespace qor {

/// The number in digits of the base (2, 10 or 16), as many bytes as it needs; nothing when a character is no digit, or
/// there is none. Underscores between digits are passed over.
std::optional<Bytes> numberOf(std::string_view digits, unsigned base);

/// The number in decimal digits.
std::string decimalText(Bytes number);

/// How many bits the number needs; 0 for zero.
unsigned bitLength(const Bytes& number);

/// The two's complement in `width` bits.
Bytes negated(Bytes number, unsigned width);

}  // namespace qor
