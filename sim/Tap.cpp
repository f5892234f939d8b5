#include "sim/Tap.h"

#include <algorithm>
#include <utility>

namespace qorsim {
namespace {

constexpr std::uint32_t idcodeOpcode = 1, bypassOpcode = 0xFFFFFFFF;

}  // namespace

Tap::Tap(std::uint32_t idcode, unsigned irLength, TapOptions options)
    : idcode_(idcode), irLength_(irLength), options_(std::move(options)) {}

std::uint32_t Tap::userOpcode(unsigned userChain) const {
  return userChain <= options_.userOpcodes.size() ? options_.userOpcodes[userChain - 1] : bypassOpcode;
}

Hub& Tap::hub(unsigned userChain) {
  std::unique_ptr<UserRegister>& place = userRegisters_[userChain - 1];
  if (!place) place = std::make_unique<UserRegister>(options_.lateness);
  return place->hub;
}

void Tap::reset() {
  instruction_.reset();
}

void Tap::captureIr() {
  selected_ = nullptr;
  register_ = ShiftRegister(bitsOf(1, irLength_));
}

void Tap::captureDr() {
  const std::size_t number = selectedUserRegister();
  selected_ = number < userChainCount ? userRegisters_[number].get() : nullptr;
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

// From 0 on; the number of them when none is selected.
std::size_t Tap::selectedUserRegister() const {
  const auto& opcodes = options_.userOpcodes;
  const auto found = instruction_ ? std::find(opcodes.begin(), opcodes.end(), *instruction_) : opcodes.end();
  return found != opcodes.end() ? static_cast<std::size_t>(found - opcodes.begin()) : userChainCount;
}

ShiftRegister Tap::captured() const {
  if (selectedUserRegister() < userChainCount) return ShiftRegister({});
  const bool isIdcode = idcode_ != 0 && instruction_.value_or(idcodeOpcode) == idcodeOpcode;
  return ShiftRegister(isIdcode ? bitsOf(idcode_, 32) : Bits{0});
}

}  // namespace qorsim
