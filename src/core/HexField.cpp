#include "src/core/HexField.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <stdexcept>
#include <string>

namespace QorRT {

namespace {

std::logic_error invalid(std::string_view text) {
  return std::logic_error("Invalid Hex String: " + std::string(text));
}

bool isDigit(char c) {
  return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'F') || (c >= 'a' && c <= 'f');
}

/// What is to the left of a text that begins with this digit.
char signFill(char first) {
  return first <= '7' ? '0' : 'F';
}

}  // namespace

std::unique_ptr<Qor_ByteBuffer> fitHexField(std::string_view text, unsigned long long bitWidth) {
  unsigned long long digitCount = 2 * ((bitWidth + 7) / 8);
  if (digitCount >= std::numeric_limits<unsigned>::max())
    throw std::length_error("A value of " + std::to_string(bitWidth) + " bits is too long.");
  if (text.empty()) throw invalid(text);
  if (text.size() < digitCount && !isDigit(text.front())) throw invalid(text.substr(0, 1));

  std::string_view kept = text.substr(text.size() - std::min<std::size_t>(text.size(), digitCount));
  if (!std::all_of(kept.begin(), kept.end(), isDigit)) throw invalid(text);

  Qor_ByteBuffer field(static_cast<unsigned>(digitCount + 1), 0, 0);
  std::size_t fillCount = digitCount - kept.size();
  std::fill_n(field.ptr(), fillCount, signFill(text.front()));
  std::memcpy(field.ptr() + fillCount, kept.data(), kept.size());
  return std::unique_ptr<Qor_ByteBuffer>(field.hex2Bin(0, static_cast<unsigned>(digitCount - 1)));
}

}  // namespace QorRT
