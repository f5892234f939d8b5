#include <utility>

#include "Sim.h"
#include "sim/BoardError.h"
#include "sim/Chain.h"
#include "sim/CoreCheck.h"
#include "sim/StatusWord.h"
#include "sim/VioCore.h"

namespace qorsim {
namespace {

std::unique_ptr<Core> makeCore(const CoreDescription& core) {
  if (core.isVio()) return std::make_unique<VioCore>(core);
  return std::make_unique<Core>(statusWord(core));
}

}  // namespace

ChainBuilder& ChainBuilder::device(unsigned idcode) {
  Device added;
  added.head = {idcode, "device" + std::to_string(devices_.size()), 6};
  devices_.push_back(std::move(added));
  return *this;
}

ChainBuilder& ChainBuilder::named(const std::string& name) {
  lastDevice("name").head.name = name;
  return *this;
}

ChainBuilder& ChainBuilder::irLength(unsigned bits) {
  Device& device = lastDevice("ir_length");
  requireRange(nameOfLast(), "ir_length", bits, Tap::shortestIr, Tap::longestIr);
  device.head.irLength = bits;
  return *this;
}

ChainBuilder& ChainBuilder::userOpcodes(const std::vector<unsigned>& opcodes) {
  Device& device = lastDevice("user_opcodes");
  requireRange(nameOfLast(), "user_opcodes", static_cast<unsigned>(opcodes.size()), 1, Tap::userChainCount);
  const unsigned bypass = 0xFFFFFFFF >> (Tap::longestIr - device.head.irLength);
  for (const unsigned opcode : opcodes) requireRange(nameOfLast(), "user_opcodes", opcode, 0, bypass - 1);
  device.userOpcodes = opcodes;
  return *this;
}

ChainBuilder& ChainBuilder::core(unsigned userChain, unsigned index, const CoreSpec& core) {
  Device& device = lastDevice("core");
  const std::string part =
      nameOfLast() + ", user chain " + std::to_string(userChain) + ", core " + std::to_string(index);
  requireRange(part, "user_chain", userChain, 1, Tap::userChainCount);
  requireRange(part, "index", index, 0, Hub::coreCount - 1);
  requireFree(part, userChain, index);
  checkCore(part, core.description());
  device.cores.push_back({userChain, index, core.description()});
  return *this;
}

ChainBuilder& ChainBuilder::lateTdi(unsigned tcks) {
  Device& device = lastDevice("late_tdi");
  requireRange(nameOfLast(), "late_tdi", tcks, 0, Lateness::most);
  device.lateTdi = tcks;
  return *this;
}

ChainBuilder& ChainBuilder::lateTdo(unsigned tcks) {
  Device& device = lastDevice("late_tdo");
  requireRange(nameOfLast(), "late_tdo", tcks, 0, Lateness::most);
  device.lateTdo = tcks;
  return *this;
}

ChainBuilder& ChainBuilder::tcksPerClock(unsigned tcks) {
  tcksPerClock_ = tcks;
  return *this;
}

std::unique_ptr<SimCable> ChainBuilder::cable() const {
  std::vector<QorRT::Qor_Device> heads;
  for (const Device& device : devices_) heads.push_back(device.head);
  return std::make_unique<SimCable>(std::move(heads), powerUp());
}

std::unique_ptr<SimPins> ChainBuilder::pins() const {
  return std::make_unique<SimPins>(powerUp());
}

std::unique_ptr<Chain> ChainBuilder::powerUp() const {
  if (devices_.empty()) throw BoardError("chain", "device", "is missing: a chain has at least one");
  auto chain = std::make_unique<Chain>(tcksPerClock_);
  for (const Device& device : devices_) {
    Tap tap(device.head.idcode, device.head.irLength, {device.userOpcodes, {device.lateTdi, device.lateTdo}});
    for (const PlacedCore& core : device.cores)
      tap.hub(core.userChain).add(core.index, makeCore(core.description));
    chain->add(std::move(tap));
  }
  return chain;
}

ChainBuilder::Device& ChainBuilder::lastDevice(const char* what) {
  if (devices_.empty()) throw BoardError("chain", what, "comes before any device");
  return devices_.back();
}

std::string ChainBuilder::nameOfLast() const {
  return "device " + std::to_string(devices_.size() - 1);
}

void ChainBuilder::requireFree(const std::string& part, unsigned userChain, unsigned index) const {
  for (const PlacedCore& core : devices_.back().cores)
    if (core.userChain == userChain && core.index == index)
      throw BoardError(part, "index", "is taken on this user chain, is " + std::to_string(index));
}

ChainBuilder chain() {
  return {};
}

ChainBuilder demoBoard() {
  const CoreSpec current =
      vio().asyncOut(8).syncOut(8).asyncIn(8).syncIn(8).version(10, 0).design(loopback());
  const CoreSpec older = vio().asyncOut(4).syncOut(4).asyncIn(16).syncIn(16).version(6, 1).design(counter());
  return chain()
      .device(0x0A5F1093)
      .named("fpga")
      .irLength(6)
      .core(1, 0, current)
      .core(1, 1, otherCore(7))
      .device(0x1234567B)
      .named("cpld")
      .irLength(8)
      .core(1, 0, older);
}

}  // namespace qorsim
