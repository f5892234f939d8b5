#include "sim/VioCore.h"

#include <algorithm>

#include "sim/StatusWord.h"

namespace qorsim {

VioCore::VioCore(const CoreDescription& core)
    : Core(statusWord(core)),
      asyncOut_(core.asyncOut),
      syncOut_(core.syncOut),
      asyncIn_(InputPort::Kind::async, core.asyncIn),
      syncIn_(InputPort::Kind::sync, core.syncIn),
      design_(core.design ? core.design : idle()) {
  Ports atPowerUp = ports();
  design_->start(atPowerUp);
  asyncIn_.settle();
  syncIn_.settle();
}

Reply VioCore::command(unsigned code, const Bits& payload, bool resultSeen) {
  switch (code) {
    case 0x2:
      return write(payload);
    case 0x3:
      return requestSnapshot(false);
    case 0x4:
      return acknowledge(resultSeen);
    case 0x5:
      return requestSnapshot(true);
    default:
      return Core::command(code, payload, resultSeen);
  }
}

Bits VioCore::result(unsigned code) const {
  if (code != 0x3 && code != 0x5) return Core::result(code);
  Bits digits;
  asyncIn_.appendRecords(digits);
  syncIn_.appendRecords(digits);
  std::reverse(digits.begin(), digits.end());
  return digits;
}

void VioCore::clock() {
  syncOut_.clock();
  Ports now = ports();
  design_->clock(now);
  asyncIn_.clock();
  syncIn_.clock();
  if (snapshotPending_) takeSnapshot();
}

// The payload read from its top: asynchronous values, pulse trains, asynchronous mask, synchronous mask.
Reply VioCore::write(const Bits& payload) {
  const std::size_t asyncCount = asyncOut_.size(), syncCount = syncOut_.values().size();
  const std::size_t trainDigits = syncCount * PulseTrains::steps;
  if (payload.size() != 2 * asyncCount + trainDigits + syncCount) return Reply::rejected;
  if (syncOut_.pending()) return Reply::refused;
  const auto values = payload.rbegin();
  const auto trains = values + static_cast<std::ptrdiff_t>(asyncCount);
  const auto asyncMask = trains + static_cast<std::ptrdiff_t>(trainDigits);
  const auto syncMask = asyncMask + static_cast<std::ptrdiff_t>(asyncCount);
  for (std::size_t i = 0; i < asyncCount; ++i) {
    const auto digit = static_cast<std::ptrdiff_t>(i);
    if (asyncMask[digit] != 0) asyncOut_[i] = values[digit];
  }
  syncOut_.stage(trains, syncMask);
  return Reply::accepted;
}

// A snapshot that was asked for in both ways merges: activity delivered twice is better than lost.
Reply VioCore::requestSnapshot(bool alwaysMerge) {
  snapshotPending_ = true;
  alwaysMerge_ = alwaysMerge_ || alwaysMerge;
  return Reply::accepted;
}

Reply VioCore::acknowledge(bool resultSeen) {
  if (!resultSeen) return Reply::refused;
  acknowledged_ = true;
  return Reply::accepted;
}

void VioCore::takeSnapshot() {
  const bool merge = alwaysMerge_ || !acknowledged_;
  asyncIn_.deliver(merge);
  syncIn_.deliver(merge);
  snapshotPending_ = alwaysMerge_ = acknowledged_ = false;
}

Ports VioCore::ports() {
  return {{asyncOut_.data(), asyncOut_.size()},
          syncOut_.values(),
          asyncIn_.pins(),
          syncIn_.pins(),
          asyncIn_.glitches(),
          syncIn_.glitches()};
}

}  // namespace qorsim
