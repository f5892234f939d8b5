/// @file
/// Files of samples: VCD, CSV, JSON lines.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "board/Export.h"
#include "board/model/Sample.h"

namespace qor {

/// What a recorder writes of one poll.
struct Poll {
  std::uint64_t nanoseconds = 0;     ///< since the recording began
  std::uint64_t missed = 0;          ///< polls that should have been between this one and the one before
  const std::vector<Bytes>& values;  ///< one per signal
  const std::vector<std::size_t>& changed;  ///< the signals that differ from the poll before; at first all
  /// What each signal did since the poll before: 1 rose, 2 fell, 4 sync rose, 8 sync fell, added.
  const std::vector<unsigned char>& moved;
  const std::vector<std::size_t>& movedOtherwise;  ///< the signals whose `moved` differs from the poll before
  bool isTrigger = false;                          ///< whether this one made the trigger's condition true
};

/// What is known of a recording before its first poll.
struct Heading {
  const std::vector<Signal>& signals;
  const std::vector<QOR_CORE_REF>& cores;  ///< as Signal::core counts them
  std::string when;                        ///< the trigger's condition; empty without one
};

class QORBOARD_API SampleWriter {
 public:
  SampleWriter() = default;
  SampleWriter(const SampleWriter&) = delete;
  SampleWriter& operator=(const SampleWriter&) = delete;
  virtual ~SampleWriter();
  virtual void begin(const Heading& heading) = 0;
  virtual void add(const Poll& poll) = 0;
  /// Polls that should have been between the last one and this time, the end of the recording; at least one.
  virtual void addMissed(std::uint64_t nanoseconds, std::uint64_t missed) = 0;
  virtual void end() = 0;
};

/// By the ending of the path: .vcd, .csv or .jsonl; "-" is standard output as CSV, "-.vcd" and so on as that. Throws
/// WrongUse for any other, Failure when the file cannot be made. What a poll adds is in the file at the latest a second
/// later, or with the next poll.
QORBOARD_API std::unique_ptr<SampleWriter> sampleWriter(const std::string& path);

}  // namespace qor
