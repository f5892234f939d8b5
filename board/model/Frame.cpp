#include "board/model/Frame.h"

#include "board/model/Digits.h"
#include "board/model/Errors.h"

namespace qor {

Reading::Reading(Signal signal, const Sample& sample)
    : signal_(std::move(signal)), activity_(activityOf(signal_, sample)) {
  extract(signal_, sample.values(signal_.port), value_);
  extract(signal_, sample.up(signal_.port), up_);
  extract(signal_, sample.down(signal_.port), down_);
}

std::uint64_t Reading::number() const {
  if (bitLength(value_) > 64) throw WrongUse("the value has more than 64 bits: " + signal_.name);
  std::uint64_t number = 0;
  for (auto byte = value_.rbegin(); byte != value_.rend(); ++byte) number = number << 8 | *byte;
  return number;
}

std::int64_t Reading::signedNumber() const {
  const unsigned width = signal_.width();
  const bool isBelowZero = signal_.radix == Radix::signedDec && bitAt(value_, width - 1) != 0;
  const Bytes magnitude = isBelowZero ? negated(value_, width) : value_;
  if (bitLength(magnitude) > 63)
    throw WrongUse("the value has more than 63 bits and a sign: " + signal_.name);
  std::int64_t number = 0;
  for (auto byte = magnitude.rbegin(); byte != magnitude.rend(); ++byte) number = number << 8 | *byte;
  return isBelowZero ? -number : number;
}

double Reading::scaled() const {
  return numberIn(signal_, value_) * (signal_.scale != 0 ? signal_.scale : 1);
}

std::optional<std::string> Reading::name() const {
  const std::string* const name = enumeratedName(signal_, value_);
  return name != nullptr ? std::optional(*name) : std::nullopt;
}

Reading Frame::operator[](std::string_view name) const {
  return (*this)[signals_->find(name, Direction::input)];
}

}  // namespace qor
