#include "sim/Hub.h"

#include <utility>

namespace qorsim {
namespace {

constexpr unsigned writeCode = 0x2, readCode = 0x3, mergingReadCode = 0x5;
constexpr unsigned signature = 0xA;

}  // namespace

void Hub::add(unsigned index, std::unique_ptr<Core> core) {
  cores_[index] = std::move(core);
}

Bits Hub::capture() {
  resultSeen_ = (code_ == readCode || code_ == mergingReadCode) && core_ != nullptr && !core_->pending();
  return answer();
}

void Hub::update(const Bits& received) {
  if (const std::optional<Frame> frame = parseFrame(received))
    obey(*frame);
  else
    reply_ = Reply::rejected;
}

void Hub::clock() {
  for (const std::unique_ptr<Core>& core : cores_)
    if (core) core->clock();
}

// Head, data, CRC.
Bits Hub::answer() const {
  const Bits data = core_ != nullptr ? core_->result(code_) : Bits();
  Bits out;
  out.reserve(16 + data.size() + 16);
  out.push_back(reply_ == Reply::rejected);
  out.push_back(reply_ == Reply::noSuchCode);
  out.push_back(reply_ == Reply::refused);
  out.push_back(core_ != nullptr && core_->pending());
  appendNumber(out, code_, 4);
  appendNumber(out, index_, 4);
  appendNumber(out, signature, 4);
  out.insert(out.end(), data.begin(), data.end());
  appendNumber(out, checksum(out.data(), out.size(), data.size()), 16);
  return out;
}

void Hub::obey(const Frame& frame) {
  Core* const core = cores_[frame.core].get();
  if (frame.code != writeCode && !frame.payload.empty())
    reply_ = Reply::rejected;
  else if (core == nullptr)
    reply_ = Reply::noSuchCode;
  else
    reply_ = core->command(frame.code, frame.payload, resultSeen_ && core == core_);
  if (reply_ == Reply::rejected || reply_ == Reply::refused) return;
  index_ = frame.core;
  code_ = frame.code;
  core_ = core;
}

}  // namespace qorsim
