// Finding out what stands on a chain: the scans to send, and what their captures tell.
#pragma once

#include <vector>

#include "ChainScan.h"
#include "QorExport.h"
#include "Qor_Cable.h"

namespace QorRT {

/// Chains of more devices, or more IR bits, are taken for a TDO that is stuck.
/// @{
constexpr unsigned mostDevices = 64;
constexpr unsigned mostIrBits = mostDevices * 32;
/// @}

/// The DR scan after Test-Logic-Reset, when each device offers its IDCODE or, without one, BYPASS.
QOR_API ChainScan idcodeProbe();

/// The devices that its capture shows, without their IR lengths; what stands behind the last is the ones that
/// were shifted in. Throws runtime_error when TDO is stuck.
QOR_API std::vector<Qor_Device> idcodesIn(const std::vector<unsigned char>& captured);

/// The IR scan that leaves BYPASS everywhere: a 0, which tells how long the IRs are together, then ones.
QOR_API ChainScan irProbe();

/// Sets the IR lengths from its capture, where each device shows a 1 and then a 0 first. When that can be read
/// in several ways, all are left at 0. Returns the bits of all IRs together. Throws runtime_error when the capture
/// is no row of IRs.
QOR_API std::size_t readIrLengths(std::vector<Qor_Device>& devices,
                                  const std::vector<unsigned char>& captured);

}  // namespace QorRT
