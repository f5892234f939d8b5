#include "platform/jtag/cable/wire/WireCable.h"

#include <algorithm>
#include <stdexcept>
#include <utility>

namespace QorRT {
namespace {

bool sameDevice(const WireDevice& before, const WireDevice& now) {
  return before.head.idcode == now.head.idcode && before.head.irLength == now.head.irLength;
}

}  // namespace

void WireCable::open() {
  try {
    keep(connect());
    connected_ = true;
  } catch (...) {
    disconnect();
    throw;
  }
}

void WireCable::run(std::vector<Qor_Scan>& scans) {
  if (!connected_) open();
  try {
    exchange(scans);
  } catch (...) {
    connected_ = false;
    disconnect();
    throw;
  }
}

// What stands on the chain stays as it was first found.
void WireCable::keep(std::vector<WireDevice> found) {
  if (devices_.empty()) {
    for (const WireDevice& device : found) heads_.push_back(device.head);
    devices_ = std::move(found);
  } else if (!std::equal(devices_.begin(), devices_.end(), found.begin(), found.end(), sameDevice)) {
    throw std::runtime_error("another chain stands behind the cable than when it was opened");
  }
}

}  // namespace QorRT
