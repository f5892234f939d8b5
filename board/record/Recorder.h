/// @file
/// Hands what a poll changed to a writer, at the cable's full rate: a poll allocates nothing and looks at no signal whose
/// bits stayed as they were.
#pragma once

#include <cstdint>
#include <vector>

#include "board/Export.h"
#include "board/record/Poller.h"
#include "board/record/SampleWriter.h"

namespace qor {

class QORBOARD_API Recorder {
 public:
  /// Poller and writer must outlive the recorder. Begins the file; `when` is the trigger's condition.
  Recorder(Poller& poller, std::vector<Signal> signals, SampleWriter& writer, const std::string& when = {});

  /// Writes the newest poll; times as in Poll.
  void write(std::uint64_t nanoseconds, std::uint64_t missed);

 private:
  Subscription subscription_;
  SampleWriter& writer_;
  std::vector<Bytes> values_;
  std::vector<unsigned char> moved_;
  std::vector<std::size_t> changed_, movedOtherwise_;
};

}  // namespace qor
