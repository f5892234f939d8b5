#include "Tap.h"

#include <algorithm>

namespace qorsim {
namespace {

constexpr std::uint32_t idcodeOpcode = 1, bypassOpcode = 0xFFFFFFFF;

// Shifts the stream through a register that holds `captured`; returns what stays in it.
Bits shift(Bits& stream, const Bits& captured) {
  stream.insert(stream.begin(), captured.begin(), captured.end());
  const std::size_t out = stream.size() - captured.size();
  Bits left(stream.begin() + static_cast<std::ptrdiff_t>(out), stream.end());
  stream.resize(out);
  return left;
}

}  // namespace

Tap::Tap(std::uint32_t idcode, unsigned irLength)
    : idcode_(idcode), irLength_(irLength), instruction_(idcode != 0 ? idcodeOpcode : bypassOpcode) {}

Hub& Tap::hub(unsigned userChain) {
  std::unique_ptr<Hub>& hub = hubs_[userChain - 1];
  if (!hub) hub = std::make_unique<Hub>();
  return *hub;
}

void Tap::scanIr(Bits& stream) {
  Bits captured;
  appendNumber(captured, 1, irLength_);
  instruction_ = numberAt(shift(stream, captured).data(), irLength_);
}

void Tap::scanDr(Bits& stream) {
  const bool user = instruction_ >= userOpcode(1) && instruction_ <= userOpcode(userChainCount);
  if (user && hubs_[instruction_ - userOpcode(1)]) {
    hubs_[instruction_ - userOpcode(1)]->scan(stream);
  } else if (user) {
    std::fill(stream.begin(), stream.end(), static_cast<unsigned char>(0));
  } else if (instruction_ == idcodeOpcode && idcode_ != 0) {
    Bits captured;
    appendNumber(captured, idcode_, 32);
    shift(stream, captured);
  } else {
    shift(stream, Bits{0});
  }
}

void Tap::clock() {
  for (const std::unique_ptr<Hub>& hub : hubs_)
    if (hub) hub->clock();
}

}  // namespace qorsim
