// Finding out what is on a chain: the scans to send, and what their captures say.
#pragma once

#include <vector>

#include "ChainScan.h"
#include "Qor_Cable.h"
#include "platform/jtag/cable/wire/WireDevice.h"

namespace QorRT {

/// Chains of more devices, or more IR bits, are taken for a TDO that is stuck.
/// @{
constexpr unsigned mostDevices = 64;
constexpr unsigned mostIrBits = mostDevices * 32;
/// @}

/// The DR scan after Test-Logic-Reset, when each device offers its IDCODE or, without one, BYPASS.
ChainScan idcodeProbe();

/// The devices that its capture shows, without their IR lengths; what comes after the last is the ones that
/// were shifted in. Throws runtime_error when TDO is stuck.
std::vector<Qor_Device> idcodesIn(const std::vector<unsigned char>& captured);

/// The IR scan that leaves BYPASS everywhere: a 0, which shows how long the IRs are together, then ones.
ChainScan irProbe();

/// Sets the IR lengths from its capture, where each device shows a 1 and then a 0 first. When that can be read
/// in several ways, all are left at 0. Throws runtime_error when the capture is no row of IRs.
void readIrLengths(std::vector<Qor_Device>& devices, const std::vector<unsigned char>& captured);

/// Throws runtime_error when the IR lengths, which a board file may have given, do not fit the capture: they add up to
/// another length, or a device does not show a 1 and then a 0 first.
void requireIrs(const std::vector<WireDevice>& devices, const std::vector<unsigned char>& captured);

}  // namespace QorRT
