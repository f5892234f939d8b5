// The sequences of frames by which a core is asked for its status word, written and read.
#pragma once

#include <array>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "QorCore_Records.h"
#include "Qor_Cable.h"
#include "platform/core/Qor_Frame.h"

namespace QorRT {

inline constexpr std::size_t statusWordBytes = 16;
using Qor_StatusWord = std::array<unsigned char, statusWordBytes>;

/// What a read brought: the record bits with the CRC of the hub in the 16 bits above them (bits above those
/// are 0), and the flags of the last head.
struct Qor_ReadResult {
  std::vector<unsigned char> bits;
  unsigned flags;
};

/// One core behind a debug hub. Each operation is one exchange with the adapter, repeated with more TCKs in
/// Run-Test/Idle as long as the core waits for its design clock. They throw runtime_error with the address
/// and what was seen; what they queued is dropped in any case.
class Qor_HubAccess {
 public:
  /// `cable` must outlive this. Throws logic_error for a core index above 15.
  Qor_HubAccess(Qor_Cable& cable, const QOR_CORE_REF& coreRef);

  /// For after a sequence that was broken off: the head that it left says of its frame what it would say of
  /// the same frame sent again, though that were lost on the way. Afterwards the hub's last frame is one that
  /// begins no sequence.
  void settle();

  /// False when there is no such core; `word` is as it was then, and after a failure.
  bool readStatus(Qor_StatusWord& word);

  /// `payload` holds `bitCount` bits; those beyond them are 0.
  void write(const std::vector<unsigned char>& payload, std::size_t bitCount);

  /// `recordBits` is the number of bits that the core's inputs take. `afterFailure` keeps activity that an
  /// earlier read took out of the inputs, but did not bring home.
  Qor_ReadResult read(std::size_t recordBits, bool afterFailure);

 private:
  using Frames = std::vector<Qor_Frame>;
  using Answers = std::vector<std::vector<unsigned char>>;

  /// Sends the frames until every answer is good: one answer to each but the last. Nothing when there is no
  /// such core.
  std::optional<Answers> run(Frames frames);
  Answers exchange(const Frames& frames, unsigned idleCycles);
  void flush();
  [[noreturn]] void fail(const std::string& text) const;

  Qor_Cable& cable_;
  const QOR_CORE_REF coreRef_;
};

}  // namespace QorRT
