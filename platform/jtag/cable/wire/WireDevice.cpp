#include "platform/jtag/cable/wire/WireDevice.h"

#include <stdexcept>

#include "platform/jtag/cable/boardfile/BoardFile.h"
#include "platform/jtag/cable/boardfile/TomlFile.h"

namespace QorRT {
namespace {

[[noreturn]] void contradict(std::size_t device, const std::string& found, const std::string& described) {
  throw std::runtime_error("device " + std::to_string(device) + " " + found + ", the board file says " +
                           described);
}

unsigned irLengthOf(std::size_t index, const Qor_Device& found, const DeviceEntry& entry) {
  if (found.irLength == 0 && !entry.irLength) {
    throw std::runtime_error("the IR length of device " + std::to_string(index) + ", IDCODE " +
                             idcodeText(found.idcode) +
                             ", cannot be seen in its capture; a board file can say it");
  }
  if (found.irLength != 0 && entry.irLength && *entry.irLength != found.irLength)
    contradict(index, "has an IR of " + std::to_string(found.irLength) + " bits",
               std::to_string(*entry.irLength));
  return entry.irLength.value_or(found.irLength);
}

bool fits(std::uint64_t opcode, unsigned irLength) {
  return irLength >= 64 || opcode >> irLength == 0;
}

void requireOpcodes(std::size_t index, const WireDevice& device) {
  for (const std::uint64_t opcode : device.userOpcodes) {
    if (opcode != noOpcode && !fits(opcode, device.head.irLength)) {
      throw std::runtime_error("device " + std::to_string(index) + " has an IR of " +
                               std::to_string(device.head.irLength) + " bits, too short for the opcode " +
                               std::to_string(opcode) + " of a user register");
    }
  }
}

void dropOpcodesBeyondIr(WireDevice& device) {
  for (std::uint64_t& opcode : device.userOpcodes)
    if (!fits(opcode, device.head.irLength)) opcode = noOpcode;
}

WireDevice described(std::size_t index, const Qor_Device& found, const DeviceEntry& entry) {
  if (entry.idcode && *entry.idcode != found.idcode)
    contradict(index, "has the IDCODE " + idcodeText(found.idcode), idcodeText(*entry.idcode));
  WireDevice device{found};
  device.head.irLength = irLengthOf(index, found, entry);
  if (!entry.name.empty()) device.head.name = entry.name;
  if (entry.userOpcodes) {
    device.userOpcodes = *entry.userOpcodes;
    requireOpcodes(index, device);
  }
  dropOpcodesBeyondIr(device);
  return device;
}

}  // namespace

std::vector<DeviceEntry> boardDevices(const std::string& path) {
  return boardDevicesOf(fileContents(path), path);
}

std::vector<DeviceEntry> boardDevicesOf(const std::string& text, const std::string& file) {
  const BoardFile board = readBoard(text, file);
  return {board.devices.begin(), board.devices.end()};
}

std::vector<WireDevice> describedDevices(const std::vector<Qor_Device>& found,
                                         const std::vector<DeviceEntry>& entries) {
  if (!entries.empty() && entries.size() != found.size())
    throw std::runtime_error("the chain has " + std::to_string(found.size()) +
                             " devices, the board file says " + std::to_string(entries.size()));
  std::vector<WireDevice> devices;
  devices.reserve(found.size());
  for (std::size_t i = 0; i < found.size(); ++i)
    devices.push_back(described(i, found[i], entries.empty() ? DeviceEntry() : entries[i]));
  return devices;
}

}  // namespace QorRT
