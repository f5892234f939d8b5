#include "board/model/Digits.h"

#include <algorithm>

namespace qor {
namespace {

// 99 for a character that is no digit of any base.
unsigned digitValue(char digit) {
  if (digit >= '0' && digit <= '9') return static_cast<unsigned>(digit - '0');
  if (digit >= 'a' && digit <= 'f') return static_cast<unsigned>(digit - 'a' + 10);
  if (digit >= 'A' && digit <= 'F') return static_cast<unsigned>(digit - 'A' + 10);
  return 99;
}

void multiplyAdd(Bytes& number, unsigned factor, unsigned carry) {
  for (unsigned char& byte : number) {
    carry += byte * factor;
    byte = static_cast<unsigned char>(carry);
    carry >>= 8;
  }
  if (carry != 0) number.push_back(static_cast<unsigned char>(carry));
}

unsigned divideBy(Bytes& number, unsigned divisor) {
  unsigned rest = 0;
  for (auto byte = number.rbegin(); byte != number.rend(); ++byte) {
    rest = rest << 8 | *byte;
    *byte = static_cast<unsigned char>(rest / divisor);
    rest %= divisor;
  }
  return rest;
}

}  // namespace

std::optional<Bytes> numberOf(std::string_view digits, unsigned base) {
  Bytes number;
  bool any = false;
  for (char digit : digits) {
    if (digit == '_' && any) continue;
    const unsigned value = digitValue(digit);
    if (value >= base) return std::nullopt;
    multiplyAdd(number, base, value);
    any = true;
  }
  if (!any) return std::nullopt;
  return number;
}

std::string decimalText(Bytes number) {
  std::string text;
  do {
    text += static_cast<char>('0' + divideBy(number, 10));
    while (!number.empty() && number.back() == 0) number.pop_back();
  } while (!number.empty());
  std::reverse(text.begin(), text.end());
  return text;
}

unsigned bitLength(const Bytes& number) {
  for (std::size_t byte = number.size(); byte-- > 0;)
    for (unsigned bit = 8; bit-- > 0;)
      if ((number[byte] >> bit & 1) != 0) return static_cast<unsigned>(8 * byte + bit + 1);
  return 0;
}

Bytes negated(Bytes number, unsigned width) {
  number.resize((width + 7) / 8);
  unsigned carry = 1;
  for (unsigned char& byte : number) {
    carry += static_cast<unsigned char>(~byte);
    byte = static_cast<unsigned char>(carry);
    carry >>= 8;
  }
  if (width % 8 != 0) number.back() &= static_cast<unsigned char>((1u << width % 8) - 1);
  return number;
}

}  // namespace qor
