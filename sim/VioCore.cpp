#include "sim/VioCore.h"

#include <algorithm>

#include "sim/StatusWord.h"

namespace qorsim {
namespace {

constexpr unsigned repeatBit = 0x8, tagsOfOneHost = 0xFFF0;

bool isWrite(unsigned code) {
  return (code & ~repeatBit) == 0x2;
}

bool isRead(unsigned code) {
  return (code & ~repeatBit) == 0x3 || (code & ~repeatBit) == 0x5;
}

bool isRepeat(unsigned code) {
  return (code & repeatBit) != 0;
}

}  // namespace

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

Reply VioCore::reply(const Command& command) const {
  if (isWrite(command.code))
    return isRepeat(command.code) ? replyToRepeatedWrite(command.tag) : replyToWrite();
  if (!isRead(command.code)) return Core::reply(command);
  return isRepeat(command.code) && command.tag == readTag_ ? Reply::answered : Reply::begun;
}

// No train is cut short by the next one.
Reply VioCore::replyToWrite() const {
  return syncOut_.busy() ? Reply::refused : Reply::takesPayload;
}

// Of another host's tag nobody knows whether it was obeyed before the last write.
Reply VioCore::replyToRepeatedWrite(unsigned tag) const {
  if (tag == writeTag_) return Reply::answered;
  return ((tag ^ writeTag_) & tagsOfOneHost) != 0 ? Reply::refused : replyToWrite();
}

std::size_t VioCore::payloadBits() const {
  return 2 * asyncOut_.size() + (PulseTrains::steps + 1) * syncOut_.values().size();
}

void VioCore::begin(const Command& command, const Bits& payload) {
  if (isWrite(command.code)) {
    writeTag_ = command.tag;
    write(payload);
  } else {
    readTag_ = command.tag;
    requestSnapshot((command.code & ~repeatBit) == 0x5);
  }
}

bool VioCore::waits(unsigned code) const {
  return isWrite(code) ? syncOut_.busy() : isRead(code) && snapshotPending_;
}

bool VioCore::repeats(unsigned code) const {
  return isRead(code) && merges_;
}

Bits VioCore::data(unsigned code) const {
  if (!isRead(code)) return Core::data(code);
  Bits digits;
  asyncIn_.appendRecords(digits);
  syncIn_.appendRecords(digits);
  std::reverse(digits.begin(), digits.end());
  return digits;
}

void VioCore::delivered(unsigned code) {
  if (isRead(code)) delivered_ = true;
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
void VioCore::write(const Bits& payload) {
  const auto asyncCount = static_cast<std::ptrdiff_t>(asyncOut_.size());
  const auto syncCount = static_cast<std::ptrdiff_t>(syncOut_.values().size());
  const auto values = payload.rbegin();
  const auto trains = values + asyncCount;
  const auto asyncMask = trains + syncCount * PulseTrains::steps;
  for (std::ptrdiff_t i = 0; i < asyncCount; ++i)
    if (asyncMask[i] != 0) asyncOut_[static_cast<std::size_t>(i)] = values[i];
  syncOut_.stage(trains, asyncMask + asyncCount);
}

// One that is under way serves.
void VioCore::requestSnapshot(bool alwaysMerges) {
  merges_ = alwaysMerges || (snapshotPending_ ? merges_ : !delivered_);
  snapshotPending_ = true;
  delivered_ = false;
}

void VioCore::takeSnapshot() {
  asyncIn_.deliver(merges_);
  syncIn_.deliver(merges_);
  snapshotPending_ = false;
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
