/// @file
/// A device's scans as scans of its whole chain, for cables that drive the chain bit by bit.
///
/// Conventions
///
///  1. Bits are little-endian arrays: bit i is bit (i mod 8) of byte i / 8. Bit 0 is the first on the wire;
///     bits of the last byte beyond the count are 0.
///  2. Device 0 is the one nearest to TDO: what is shifted in first ends up in it, and comes from it.
///  3. The addressed device is always one of the chain.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "QorExport.h"
#include "Qor_Cable.h"

namespace QorRT {

/// What a scan of the whole chain shifts into TDI.
struct ChainScan {
  std::vector<unsigned char> bits;  ///< bit 0 is the first on the wire
  std::size_t bitCount;             ///< of the whole chain
};

/// The IR scan that gives one device an opcode (the low bits of `opcode`, as many as its IR has; an IR longer
/// than 64 bits gets the highest of them above) and all others BYPASS, which is all ones.
QOR_API ChainScan chainIrScan(const std::vector<Qor_Device>& devices, unsigned device, std::uint64_t opcode);

/// The DR scan whose last `bitCount` bits in the device's register are `out`, with all other devices in
/// BYPASS. It is one bit longer for each of them; ones are before and after the device's bits.
QOR_API ChainScan chainDrScan(std::size_t deviceCount, unsigned device, const std::vector<unsigned char>& out,
                              std::size_t bitCount);

/// The first `bitCount` bits that the device itself delivered in a DR scan of chainDrScan(), picked out of
/// the bits that came out of TDO.
QOR_API std::vector<unsigned char> chainDrCapture(unsigned device, const std::vector<unsigned char>& tdo,
                                                  std::size_t bitCount);

}  // namespace QorRT
