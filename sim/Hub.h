// The hub at the end of a user chain: it understands a frame while it is shifted in, and answers in the same scan.
#pragma once

#include <array>
#include <memory>

#include "sim/Core.h"
#include "sim/Crc.h"

namespace qorsim {

class Hub {
 public:
  static constexpr unsigned coreCount = 16;

  /// Adds a core to the hub, at an index that is free.
  void add(unsigned index, std::unique_ptr<Core> core);

  /// A TCK in Capture-DR.
  void capture();

  /// The bit at its TDO end.
  bool out() const { return out_; }

  /// A TCK in Shift-DR.
  void shift(bool in);

  /// As many such TCKs as only gather or send, at most `count`: replaces what goes in by what comes out, and
  /// returns how many there were. A shortcut for shift().
  std::size_t shiftRun(unsigned char* bits, std::size_t count);

  /// Whether the next bits are those of an answer before its data: a core may need the design clock for them.
  bool leavesTime() const;

  /// Any other TCK. What a frame begins, it begins in the TCK after its last bit.
  void settle();

  /// One design clock of every core.
  void clock();

 private:
  // First what TDI brings, then what goes to TDO.
  enum class Phase { search, header, headerCrc, payload, payloadCrc, zero, head, wait, data, crc, silence };

  bool gathers() const { return phase_ >= Phase::header && phase_ <= Phase::payloadCrc; }
  bool sends() const { return phase_ == Phase::head || phase_ == Phase::data || phase_ == Phase::crc; }

  void search(bool in);
  void gather(Phase phase, std::size_t count);
  void gatherNext(bool in);
  void gathered();
  void takeHeader();
  void takeCommand();
  void takePayload();
  void obeyPayload();
  bool crcHolds() const;

  void send(Phase phase, Bits bits);
  void sendNext();
  void sent();
  Bits head() const;
  Bits data() const;
  void finishWaiting();
  bool waits() const { return core_ != nullptr && core_->waits(command_.code); }

  std::array<std::unique_ptr<Core>, coreCount> cores_;

  // Of the scan.
  Phase phase_ = Phase::silence;
  Crc crc_;  // runs over the header, a payload that is taken, head and data
  bool lastIn_ = false;
  bool out_ = false;

  // Of the phase: bits that were gathered of `count_`, or of which `count_` were sent.
  Bits bits_;
  std::size_t count_ = 0;

  // Of the frame.
  Core* core_ = nullptr;  // of cores_; null when there is none at that index
  Command command_;
  Reply reply_ = Reply::unknown;
  Bits payload_;
  bool begins_ = false;  // in the next TCK
};

}  // namespace qorsim
