#include "sim/Tap.h"

namespace qorsim {
namespace {

constexpr std::uint32_t idcodeOpcode = 1, bypassOpcode = 0xFFFFFFFF;

Bits bitsOf(std::uint32_t value, unsigned count) {
  Bits bits;
  bits.reserve(count);
  appendNumber(bits, value, count);
  return bits;
}

}  // namespace

Tap::Tap(std::uint32_t idcode, unsigned irLength) : idcode_(idcode), irLength_(irLength) {
  reset();
}

Hub& Tap::hub(unsigned userChain) {
  std::unique_ptr<Hub>& hub = hubs_[userChain - 1];
  if (!hub) hub = std::make_unique<Hub>();
  return *hub;
}

void Tap::reset() {
  instruction_ = idcode_ != 0 ? idcodeOpcode : bypassOpcode;
}

void Tap::captureIr() {
  register_ = ShiftRegister::passing(bitsOf(1, irLength_));
}

void Tap::captureDr() {
  if (Hub* const hub = selectedHub())
    register_ = ShiftRegister::keeping(hub->capture());
  else if (userSelected())
    register_ = ShiftRegister::keeping({});
  else if (instruction_ == idcodeOpcode && idcode_ != 0)
    register_ = ShiftRegister::passing(bitsOf(idcode_, 32));
  else
    register_ = ShiftRegister::passing({0});
}

void Tap::updateIr() {
  instruction_ = numberAt(register_.take().data(), irLength_);
}

void Tap::updateDr() {
  if (Hub* const hub = selectedHub()) hub->update(register_.take());
}

void Tap::scanIr(Bits& stream) {
  captureIr();
  register_.shift(stream);
  updateIr();
}

void Tap::scanDr(Bits& stream) {
  captureDr();
  register_.shift(stream);
  updateDr();
}

void Tap::clock() {
  for (const std::unique_ptr<Hub>& hub : hubs_)
    if (hub) hub->clock();
}

bool Tap::userSelected() const {
  return instruction_ >= userOpcode(1) && instruction_ <= userOpcode(userChainCount);
}

Hub* Tap::selectedHub() const {
  return userSelected() ? hubs_[instruction_ - userOpcode(1)].get() : nullptr;
}

}  // namespace qorsim
