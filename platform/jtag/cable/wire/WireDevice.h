// A device on a real chain, and what a board file says of the devices there.
#pragma once

#include <string>
#include <vector>

#include "Qor_Cable.h"
#include "platform/jtag/cable/boardfile/DeviceEntry.h"

namespace QorRT {

struct WireDevice {
  Qor_Device head;
  UserOpcodes userOpcodes{2, 3, 4, 5};
};

/// The devices of a board file, the one nearest to TDO first; of a simulated board's file, what is known of it
/// from outside. Throws runtime_error, "FILE:LINE: KEY: what is wrong".
/// @{
std::vector<DeviceEntry> boardDevices(const std::string& path);
std::vector<DeviceEntry> boardDevicesOf(const std::string& text, const std::string& file);
/// @}

/// Lays what the board file says over what was found on the chain: names, IR lengths, opcodes. Throws
/// runtime_error when they contradict each other: another number of devices, another IDCODE or IR length, an
/// opcode that the IR has no room for. An IR length found as 0 is an unknown one, and must be in the file.
std::vector<WireDevice> describedDevices(const std::vector<Qor_Device>& found,
                                         const std::vector<DeviceEntry>& entries);

}  // namespace QorRT
