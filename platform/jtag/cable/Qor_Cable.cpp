#include "Qor_Cable.h"

#include <array>
#include <cstdio>
#include <stdexcept>
#include <utility>

namespace QorRT {
namespace {

void requireBytes(std::size_t bytes, std::size_t bitCount) {
  if (bytes == bitCount / 8 + (bitCount % 8 != 0 ? 1 : 0)) return;
  throw std::logic_error("a DR scan of " + std::to_string(bitCount) + " bits does not fit " +
                         std::to_string(bytes) + " bytes");
}

void requireCaptures(const std::vector<Qor_Scan>& scans) {
  for (const Qor_Scan& scan : scans) {
    if (!scan.capture || scan.in.size() == scan.out.size()) continue;
    throw std::runtime_error("the cable delivered " + std::to_string(scan.in.size()) + " of the " +
                             std::to_string(scan.out.size()) + " bytes of a scan");
  }
}

}  // namespace

std::string idcodeText(unsigned idcode) {
  std::array<char, 9> digits{};
  std::snprintf(digits.data(), digits.size(), "%08X", idcode);
  return digits.data();
}

Qor_Cable::~Qor_Cable() = default;

void Qor_Cable::scanIr(unsigned device, unsigned userChain, bool always) {
  requireDevice(device);
  if (userChain < 1 || userChain > userChainCount) {
    throw std::logic_error("device " + std::to_string(device) + " has no user chain " +
                           std::to_string(userChain) + ": they are 1 to " + std::to_string(userChainCount));
  }
  Qor_Scan scan{Qor_Scan::Kind::ir};
  scan.device = device;
  scan.userChain = userChain;
  scan.always = always;
  queue(std::move(scan));
}

std::size_t Qor_Cable::scanDr(unsigned device, std::vector<unsigned char> out, std::size_t bitCount,
                              bool capture) {
  requireDevice(device);
  requireBytes(out.size(), bitCount);
  Qor_Scan scan{Qor_Scan::Kind::dr};
  scan.device = device;
  scan.out = std::move(out);
  scan.bitCount = bitCount;
  scan.capture = capture;
  queue(std::move(scan));
  return scans_.size() - 1;
}

void Qor_Cable::idle(unsigned cycles) {
  Qor_Scan scan{Qor_Scan::Kind::idle};
  scan.cycles = cycles;
  queue(std::move(scan));
}

void Qor_Cable::flush() {
  if (scans_.empty() || ran_) return;
  try {
    run(scans_);
    requireCaptures(scans_);
  } catch (...) {
    drop();
    throw;
  }
  ran_ = true;
}

void Qor_Cable::drop() noexcept {
  scans_.clear();
  ran_ = false;
}

const std::vector<unsigned char>& Qor_Cable::captured(std::size_t scan) {
  flush();
  if (scan >= scans_.size() || !scans_[scan].capture) {
    throw std::logic_error("scan " + std::to_string(scan) + " of the queue captured nothing");
  }
  return scans_[scan].in;
}

void Qor_Cable::queue(Qor_Scan scan) {
  if (ran_) drop();
  scans_.push_back(std::move(scan));
}

void Qor_Cable::requireDevice(unsigned device) const {
  const std::size_t count = devices().size();
  if (device < count) return;
  throw std::logic_error("there is no device " + std::to_string(device) + ": the chain has " +
                         std::to_string(count) + (count == 1 ? " device" : " devices"));
}

}  // namespace QorRT
