// The transfers by which a core is asked for its status word, written and read: each one IR scan and one DR scan.
#pragma once

#include <array>
#include <cstddef>
#include <string>
#include <vector>

#include "QorCore_Records.h"
#include "Qor_Cable.h"
#include "platform/core/Qor_CoreLink.h"
#include "platform/core/Qor_Frame.h"
#include "platform/jtag/Qor_LinkRecord.h"

namespace QorRT {

inline constexpr std::size_t statusWordBytes = 16;
using Qor_StatusWord = std::array<unsigned char, statusWordBytes>;

/// What a read brought: the record bits with the low 16 bits of the hub's CRC above them (bits above those are 0), and
/// the flags of the head.
struct Qor_ReadResult {
  Qor_Bytes bits;
  unsigned flags;
};

/// One core of a debug hub. A transfer that comes back damaged is repeated, at most three times; one that waits
/// for the design clock with more room or time, for two seconds. The hub knows a repeat by its tag: a write is done
/// once, and a record is delivered again. They throw Qor_NoHub, or runtime_error with the address and what was seen at
/// each attempt; what they queued is dropped in any case.
class Qor_HubAccess {
 public:
  /// `cable`, `record` and `link` must outlive this. Throws logic_error for a core index above 15.
  Qor_HubAccess(Qor_Cable& cable, Qor_LinkRecord& record, Qor_CoreLink& link, const QOR_CORE_REF& coreRef);

  /// False when there is no such core; `word` is as it was then, and after a failure. Finds out how late the hub's
  /// TDI and TDO are.
  bool readStatus(Qor_StatusWord& word);

  /// `payload` contains `bitCount` bits; those beyond them are 0. `playsTrains`: it marks synchronous outputs.
  void write(const Qor_Bytes& payload, std::size_t bitCount, bool playsTrains);

  /// `recordBits` is the number of bits that the core's inputs take. `keepActivity`: an earlier read took it out of
  /// the inputs, but may not have brought it home.
  Qor_ReadResult read(std::size_t recordBits, bool keepActivity);

  /// Makes this the tag of the core's last write, by one that marks no output. False when there is no such core.
  bool mark(unsigned tag, std::size_t payloadBits);

  /// Whether it is. No output changes.
  bool isMarked(unsigned tag, std::size_t payloadBits);

 private:
  void introduce(std::size_t payloadBits);
  Qor_Answer ask(Qor_Request request, Qor_WaitingRoom& room);
  Qor_Answer exchange(const Qor_Request& request, std::size_t room, bool selects, std::string& seen);
  Qor_Answer calibrate(const Qor_Frame& frame, const Qor_Bytes& bits, std::size_t bitCount);
  Qor_Bytes run(const Qor_Bytes& out, std::size_t bitCount, bool selects);
  QorJtag_Hub hub() const;
  [[noreturn]] void fail(const std::string& text) const;

  Qor_Cable& cable_;
  Qor_LinkRecord& record_;
  Qor_CoreLink& link_;
  const QOR_CORE_REF coreRef_;
  const std::size_t lead_;  // bits of the bypassed devices, which the hub sees before the frame
};

}  // namespace QorRT
