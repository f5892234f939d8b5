#include "platform/jtag/cable/wire/ChainProbe.h"

#include <algorithm>
#include <stdexcept>
#include <string>

namespace QorRT {
namespace {

using Bytes = std::vector<unsigned char>;

constexpr std::size_t idcodeBits = 32;

// Enough for the longest chain and the first bits that come out after it.
constexpr std::size_t idcodeProbeBits = (mostDevices + 1) * idcodeBits;
constexpr std::size_t irProbeBits = mostIrBits + 8;

ChainScan ones(std::size_t bitCount) {
  return {Bytes(bitCount / 8, 0xFF), bitCount};
}

bool bitAt(const Bytes& bits, std::size_t index) {
  return (bits[index / 8] >> index % 8 & 1) != 0;
}

unsigned wordAt(const Bytes& bits, std::size_t first) {
  unsigned word = 0;
  for (unsigned i = 0; i < idcodeBits; ++i) word |= unsigned{bitAt(bits, first + i)} << i;
  return word;
}

// The place of the last 0, or -1 when there is none.
std::ptrdiff_t lastZero(const Bytes& bits) {
  auto place = static_cast<std::ptrdiff_t>(bits.size() * 8) - 1;
  while (place >= 0 && bitAt(bits, static_cast<std::size_t>(place))) --place;
  return place;
}

}  // namespace

ChainScan idcodeProbe() {
  return ones(idcodeProbeBits);
}

std::vector<Qor_Device> idcodesIn(const Bytes& captured) {
  std::vector<Qor_Device> devices;
  std::size_t place = 0;
  while (place + idcodeBits <= idcodeProbeBits) {
    const bool hasIdcode = bitAt(captured, place);
    const unsigned idcode = hasIdcode ? wordAt(captured, place) : 0;
    if (idcode == 0xFFFFFFFF) break;
    devices.push_back({idcode, "device" + std::to_string(devices.size()), 0});
    place += hasIdcode ? idcodeBits : 1;
  }
  if (devices.empty()) throw std::runtime_error("no device answers on the chain, TDO is all ones");
  if (std::all_of(captured.begin(), captured.end(), [](unsigned char byte) { return byte == 0; }))
    throw std::runtime_error("no device answers on the chain, TDO is all zeros");
  if (devices.size() > mostDevices || place + idcodeBits > idcodeProbeBits)
    throw std::runtime_error("the chain has no end: after " + std::to_string(devices.size()) +
                             " devices TDO does not bring back what TDI was given");
  return devices;
}

ChainScan irProbe() {
  ChainScan probe = ones(irProbeBits);
  probe.bits[0] = 0xFE;
  return probe;
}

void readIrLengths(std::vector<Qor_Device>& devices, const Bytes& captured) {
  const std::ptrdiff_t total = lastZero(captured);
  if (total <= 0 || total > static_cast<std::ptrdiff_t>(mostIrBits) || !bitAt(captured, 0))
    throw std::runtime_error(
        "the instruction registers of the chain do not answer: TDO brings back no 1 and 0");
  std::vector<std::size_t> starts;
  for (std::size_t i = 0; i + 1 < static_cast<std::size_t>(total); ++i)
    if (bitAt(captured, i) && !bitAt(captured, i + 1)) starts.push_back(i);
  if (devices.size() == 1) starts = {0};
  const bool clear = starts.size() == devices.size() && starts.front() == 0;
  starts.push_back(static_cast<std::size_t>(total));
  for (std::size_t i = 0; i < devices.size(); ++i)
    devices[i].irLength = clear ? static_cast<unsigned>(starts[i + 1] - starts[i]) : 0;
}

void requireIrs(const std::vector<WireDevice>& devices, const Bytes& captured) {
  const auto total = static_cast<std::size_t>(lastZero(captured));
  std::size_t start = 0;
  for (std::size_t i = 0; i < devices.size(); ++i) {
    if (start + 1 >= total || !bitAt(captured, start) || bitAt(captured, start + 1))
      throw std::runtime_error("the IR of device " + std::to_string(i) +
                               " does not begin with 1 and 0 where the board file has it");
    start += devices[i].head.irLength;
  }
  if (start != total)
    throw std::runtime_error("the IRs of the chain have " + std::to_string(total) +
                             " bits together, the board file says " + std::to_string(start));
}

}  // namespace QorRT
