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
  std::uint64_t nanoseconds;         ///< since the recording began
  std::uint64_t missed;              ///< polls that should have been between this one and the one before
  const std::vector<Bytes>& values;  ///< one per signal
  const std::vector<std::size_t>& changed;  ///< the signals that differ from the poll before; at first all
  const std::vector<unsigned char>& moved;  ///< 1 for a signal with activity since the poll before
  const std::vector<std::size_t>& movedOtherwise;  ///< the signals whose `moved` differs from the poll before
  const std::vector<Sample>& samples;              ///< one per core
};

class QORBOARD_API SampleWriter {
 public:
  SampleWriter() = default;
  SampleWriter(const SampleWriter&) = delete;
  SampleWriter& operator=(const SampleWriter&) = delete;
  virtual ~SampleWriter();
  /// `cores` as Signal::core counts them.
  virtual void begin(const std::vector<Signal>& signals, const std::vector<QOR_CORE_REF>& cores) = 0;
  virtual void add(const Poll& poll) = 0;
  /// Polls that should have been between the last one and this time, the end of the recording; at least one.
  virtual void addMissed(std::uint64_t nanoseconds, std::uint64_t missed) = 0;
  virtual void end() = 0;
};

/// By the ending of the path: .vcd, .csv or .jsonl. Throws WrongUse for any other, Failure when the file cannot be
/// made. What a poll adds is in the file at the latest a second later, or with the next poll.
QORBOARD_API std::unique_ptr<SampleWriter> sampleWriter(const std::string& path);

}  // namespace qor
