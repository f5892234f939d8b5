#include "sim/Tap.h"

namespace qorsim {
namespace {

constexpr std::uint32_t idcodeOpcode = 1, bypassOpcode = 0xFFFFFFFF;

}  // namespace

Tap::Tap(std::uint32_t idcode, unsigned irLength, Lateness lateness)
    : idcode_(idcode), irLength_(irLength), lateness_(lateness) {
  reset();
}

Hub& Tap::hub(unsigned userChain) {
  std::unique_ptr<UserRegister>& place = userRegisters_[userChain - 1];
  if (!place) place = std::make_unique<UserRegister>(lateness_);
  return place->hub;
}

void Tap::reset() {
  instruction_ = idcode_ != 0 ? idcodeOpcode : bypassOpcode;
}

void Tap::captureIr() {
  selected_ = nullptr;
  register_ = ShiftRegister(bitsOf(1, irLength_));
}

void Tap::captureDr() {
  selected_ = isUserOpcode() ? userRegisters_[instruction_ - userOpcode(1)].get() : nullptr;
  if (selected_ != nullptr)
    selected_->capture();
  else
    register_ = captured();
}

void Tap::shift(bool in) {
  if (selected_ != nullptr)
    selected_->shift(in);
  else
    register_.shift(in);
}

void Tap::shift(Bits& stream, const std::function<void()>& passTck) {
  if (selected_ == nullptr) return register_.shift(stream);
  for (std::size_t i = 0; i < stream.size();) {
    i += selected_->shiftRun(&stream[i], stream.size() - i);
    if (i == stream.size()) break;
    const bool passes = leavesTime(), in = stream[i] != 0;
    stream[i++] = selected_->out();
    selected_->shift(in);
    if (passes) passTck();
  }
}

void Tap::updateIr() {
  instruction_ = numberAt(register_.take().data(), irLength_);
}

void Tap::settle() {
  for (const std::unique_ptr<UserRegister>& each : userRegisters_)
    if (each) each->hub.settle();
}

void Tap::clock() {
  for (const std::unique_ptr<UserRegister>& each : userRegisters_)
    if (each) each->hub.clock();
}

bool Tap::isUserOpcode() const {
  return instruction_ >= userOpcode(1) && instruction_ <= userOpcode(userChainCount);
}

ShiftRegister Tap::captured() const {
  if (isUserOpcode()) return ShiftRegister({});
  if (instruction_ == idcodeOpcode && idcode_ != 0) return ShiftRegister(bitsOf(idcode_, 32));
  return ShiftRegister({0});
}

}  // namespace qorsim
