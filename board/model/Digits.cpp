#include "board/model/Digits.h"

#include <cstdint>
#include <vector>

namespace qor {
namespace {

using Limbs = std::vector<std::uint32_t>;  // least significant first

constexpr unsigned digitsAtOnce = 9;
constexpr std::uint32_t base9 = 1000000000;

// 99 for a character that is no digit of any base.
unsigned digitValue(char digit) {
  if (digit >= '0' && digit <= '9') return static_cast<unsigned>(digit - '0');
  if (digit >= 'a' && digit <= 'f') return static_cast<unsigned>(digit - 'a' + 10);
  if (digit >= 'A' && digit <= 'F') return static_cast<unsigned>(digit - 'A' + 10);
  return 99;
}

// The values of the digits from the first one on that is not 0; nothing for what is no number.
std::optional<Bytes> valuesOf(std::string_view digits, unsigned base) {
  Bytes values;
  bool any = false;
  for (char digit : digits) {
    if (digit == '_' && any) continue;
    const unsigned value = digitValue(digit);
    if (value >= base) return std::nullopt;
    any = true;
    if (value != 0 || !values.empty()) values.push_back(static_cast<unsigned char>(value));
  }
  if (!any) return std::nullopt;
  return values;
}

Bytes joinBits(const Bytes& values, unsigned bitsEach) {
  Bytes number((values.size() * bitsEach + 7) / 8);
  std::size_t bit = 0;
  for (auto value = values.rbegin(); value != values.rend(); ++value, bit += bitsEach)
    number[bit / 8] = static_cast<unsigned char>(number[bit / 8] | *value << bit % 8);
  return number;
}

void multiplyAdd(Limbs& number, std::uint32_t factor, std::uint32_t add) {
  std::uint64_t carry = add;
  for (std::uint32_t& limb : number) {
    carry += std::uint64_t{limb} * factor;
    limb = static_cast<std::uint32_t>(carry);
    carry >>= 32;
  }
  if (carry != 0) number.push_back(static_cast<std::uint32_t>(carry));
}

Bytes joinDecimals(const Bytes& values) {
  Limbs limbs;
  std::uint32_t part = 0, factor = 1;
  for (std::size_t i = 0; i < values.size(); ++i) {
    part = part * 10 + values[i];
    factor *= 10;
    if (factor != base9 && i + 1 != values.size()) continue;
    multiplyAdd(limbs, factor, part);
    part = 0;
    factor = 1;
  }
  Bytes number;
  for (std::uint32_t limb : limbs)
    for (unsigned shift = 0; shift < 32; shift += 8)
      number.push_back(static_cast<unsigned char>(limb >> shift));
  return number;
}

// A number that has one bit more than `widest`.
Bytes tooWide(unsigned widest) {
  Bytes number(byteCount(widest + 1));
  setBit(number, widest, 1);
  return number;
}

Limbs limbsOf(const Bytes& number) {
  Limbs limbs((number.size() + 3) / 4);
  for (std::size_t i = 0; i < number.size(); ++i) limbs[i / 4] |= std::uint32_t{number[i]} << 8 * (i % 4);
  while (!limbs.empty() && limbs.back() == 0) limbs.pop_back();
  return limbs;
}

std::uint32_t divideBy(Limbs& number, std::uint32_t divisor) {
  std::uint64_t rest = 0;
  for (auto limb = number.rbegin(); limb != number.rend(); ++limb) {
    rest = rest << 32 | *limb;
    *limb = static_cast<std::uint32_t>(rest / divisor);
    rest %= divisor;
  }
  while (!number.empty() && number.back() == 0) number.pop_back();
  return static_cast<std::uint32_t>(rest);
}

}  // namespace

std::optional<Bytes> numberOf(std::string_view digits, unsigned base, unsigned widest) {
  const std::optional<Bytes> values = valuesOf(digits, base);
  if (!values) return std::nullopt;
  // A decimal digit takes more than 3 bits, a number of n digits at least 3 (n - 1).
  const std::size_t leastBits = (base == 16   ? 4
                                 : base == 10 ? 3
                                              : 1) *
                                (values->empty() ? 0 : values->size() - 1);
  if (leastBits >= std::size_t{widest} + 8) return tooWide(widest);
  return base == 10 ? joinDecimals(*values) : joinBits(*values, base == 16 ? 4 : 1);
}

std::string decimalText(const Bytes& number) {
  Limbs limbs = limbsOf(number);
  std::vector<std::uint32_t> parts;
  do parts.push_back(divideBy(limbs, base9));
  while (!limbs.empty());
  std::string text = std::to_string(parts.back());
  for (std::size_t i = parts.size() - 1; i-- > 0;) {
    const std::string part = std::to_string(parts[i]);
    text.append(digitsAtOnce - part.size(), '0').append(part);
  }
  return text;
}

unsigned bitLength(const Bytes& number) {
  for (std::size_t byte = number.size(); byte-- > 0;)
    for (unsigned bit = 8; bit-- > 0;)
      if ((number[byte] >> bit & 1) != 0) return static_cast<unsigned>(8 * byte + bit + 1);
  return 0;
}

Bytes negated(Bytes number, unsigned width) {
  number.resize(byteCount(width));
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
