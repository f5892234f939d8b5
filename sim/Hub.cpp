#include "sim/Hub.h"

#include <algorithm>
#include <utility>

namespace qorsim {
namespace {

constexpr std::size_t headerBits = 24, crcBits = 32;
constexpr unsigned unknownFlag = 2, refusedFlag = 4, repeatsFlag = 8, signature = 0xA;

}  // namespace

void Hub::add(unsigned index, std::unique_ptr<Core> core) {
  cores_[index] = std::move(core);
}

void Hub::capture() {
  settle();
  phase_ = Phase::search;
  crc_ = {};
  lastIn_ = false;
  out_ = true;
}

void Hub::shift(bool in) {
  settle();
  if (phase_ == Phase::search)
    search(in);
  else if (gathers())
    gatherNext(in);
  else if (sends())
    sendNext();
  else if (phase_ == Phase::zero)
    send(Phase::head, head());
  else if (phase_ == Phase::wait)
    finishWaiting();
}

std::size_t Hub::shiftRun(unsigned char* bits, std::size_t count) {
  if (begins_ || bits_.size() == count_) return 0;
  if (phase_ == Phase::payload) {
    count = std::min(count, count_ - bits_.size() - 1);
    bits_.insert(bits_.end(), bits, bits + count);
    std::fill_n(bits, count, static_cast<unsigned char>(0));
  } else if (phase_ == Phase::data) {
    count = std::min(count, bits_.size() - count_);
    bits[0] = out_;
    std::copy_n(bits_.begin() + static_cast<std::ptrdiff_t>(count_), count - 1, bits + 1);
    count_ += count;
    out_ = bits_[count_ - 1] != 0;
  } else {
    count = 0;
  }
  return count;
}

bool Hub::leavesTime() const {
  return phase_ == Phase::zero || phase_ == Phase::head || phase_ == Phase::wait;
}

void Hub::settle() {
  if (std::exchange(begins_, false)) core_->begin(command_, payload_);
}

void Hub::clock() {
  for (const std::unique_ptr<Core>& core : cores_)
    if (core) core->clock();
}

void Hub::search(bool in) {
  out_ = false;
  if (std::exchange(lastIn_, in) && !in) gather(Phase::header, headerBits);
}

void Hub::gather(Phase phase, std::size_t count) {
  phase_ = phase;
  bits_.clear();
  count_ = count;
  if (count == 0) gathered();
}

void Hub::gatherNext(bool in) {
  bits_.push_back(in);
  if (bits_.size() == count_) gathered();
}

void Hub::gathered() {
  if (phase_ == Phase::header)
    takeHeader();
  else if (phase_ == Phase::payload)
    takePayload();
  else if (!crcHolds())
    phase_ = Phase::silence;
  else if (phase_ == Phase::headerCrc)
    takeCommand();
  else
    obeyPayload();
}

void Hub::takeHeader() {
  crc_.add(bits_);
  command_ = {numberAt(bits_.data(), 4), numberAt(bits_.data() + 8, 16)};
  core_ = cores_[numberAt(bits_.data() + 4, 4)].get();
  gather(Phase::headerCrc, crcBits);
}

void Hub::takeCommand() {
  reply_ = core_ != nullptr ? core_->reply(command_) : Reply::unknown;
  begins_ = reply_ == Reply::begun;
  phase_ = Phase::zero;
  if (reply_ == Reply::takesPayload) gather(Phase::payload, core_->payloadBits());
}

void Hub::takePayload() {
  crc_.add(bits_);
  payload_.swap(bits_);
  gather(Phase::payloadCrc, crcBits);
}

void Hub::obeyPayload() {
  begins_ = true;
  phase_ = Phase::zero;
}

bool Hub::crcHolds() const {
  return numberAt(bits_.data(), crcBits) == crc_.value();
}

void Hub::send(Phase phase, Bits bits) {
  phase_ = phase;
  bits_ = std::move(bits);
  count_ = 0;
  if (phase != Phase::crc) crc_.add(bits_);
  sendNext();
}

void Hub::sendNext() {
  if (count_ < bits_.size())
    out_ = bits_[count_++] != 0;
  else
    sent();
}

// The TCK that takes the last bit.
void Hub::sent() {
  if (phase_ == Phase::head) {
    phase_ = Phase::wait;
    out_ = !waits();
  } else if (phase_ == Phase::data) {
    send(Phase::crc, bitsOf(crc_.value(), crcBits));
  } else {
    phase_ = Phase::silence;
    out_ = false;
    if (core_ != nullptr) core_->delivered(command_.code);
  }
}

Bits Hub::head() const {
  unsigned flags = 0;
  if (reply_ == Reply::unknown) flags = unknownFlag;
  if (reply_ == Reply::refused) flags = refusedFlag;
  if (core_ != nullptr && core_->repeats(command_.code)) flags |= repeatsFlag;
  return bitsOf(flags | signature << 4, 8);
}

// The 1 that ends the wait has left, or another bit of it.
void Hub::finishWaiting() {
  if (out_)
    send(Phase::data, data());
  else
    out_ = !waits();
}

Bits Hub::data() const {
  const bool isEmpty = reply_ == Reply::unknown || reply_ == Reply::refused;
  return isEmpty ? Bits() : core_->data(command_.code);
}

}  // namespace qorsim
