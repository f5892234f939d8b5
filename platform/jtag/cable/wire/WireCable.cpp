#include "platform/jtag/cable/wire/WireCable.h"

#include <algorithm>
#include <stdexcept>

#include "os/Cancel.h"

namespace QorRT {
namespace {

constexpr double slowestTck = 20000;  // Hz

bool sameDevice(const WireDevice& before, const WireDevice& now) {
  return before.head.idcode == now.head.idcode && before.head.irLength == now.head.irLength;
}

// With room for the walk through the states, and for the other devices.
std::size_t tcksOf(const Qor_Scan& scan) {
  return scan.kind == Qor_Scan::Kind::idle ? scan.cycles : scan.bitCount + 32;
}

}  // namespace

WireCable::WireCable(WireUrl url, StopFunction stop)
    : url_(std::move(url)),
      stop_(std::move(stop)),
      board_(url_.board.empty() ? std::vector<DeviceEntry>() : boardDevices(url_.board)) {}

// Sockets and a server's process are used in destructors too: a thread is not cancelled until it has done with them.
void WireCable::open() {
  const os::CancelLater guard;
  try {
    keep(connect());
    connected_ = true;
  } catch (...) {
    giveUp();
    throw;
  }
}

void WireCable::run(std::vector<Qor_Scan>& scans) {
  if (!connected_) open();
  std::size_t tcks = 0;
  for (const Qor_Scan& scan : scans) tcks += tcksOf(scan);
  {
    const os::CancelLater guard;
    try {
      exchange(scans, deadlineOf(tcks));
    } catch (...) {
      giveUp();
      throw;
    }
  }
  os::endIfCancelled();
}

Deadline WireCable::deadlineOf(std::size_t tcks) const {
  return Deadline(url_.timeout + Seconds(static_cast<double>(tcks) / slowestTck));
}

Deadline WireCable::leaveTime() const {
  return Deadline(std::min(url_.timeout, Seconds(0.5)));
}

bool WireCable::isSelected(const Qor_Scan& ir) {
  const std::pair<unsigned, unsigned> wanted(ir.device, ir.userChain);
  return std::exchange(selected_, wanted) == wanted && !ir.always;
}

void WireCable::giveUp() noexcept {
  connected_ = false;
  selected_.reset();
  disconnect();
}

// The chain stays as it was first found.
void WireCable::keep(std::vector<WireDevice> found) {
  if (devices_.empty()) {
    for (const WireDevice& device : found) heads_.push_back(device.head);
    devices_ = std::move(found);
  } else if (!std::equal(devices_.begin(), devices_.end(), found.begin(), found.end(), sameDevice)) {
    throw std::runtime_error("the cable leads to another chain than when it was opened");
  }
}

}  // namespace QorRT
