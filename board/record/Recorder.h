// Polls a core and hands what changed to a writer, at the cable's full rate: a poll allocates nothing and looks at no
// signal whose bits stayed as they were.
#pragma once

#include <cstdint>
#include <vector>

#include "board/record/SampleWriter.h"
#include "board/session/CoreSession.h"

namespace qor {

class Recorder {
 public:
  /// Core and writer must outlive the recorder. Begins the file.
  Recorder(CoreSession& core, const std::vector<Signal>& signals, SampleWriter& writer);

  /// Reads once. Throws Failure, with nothing of the poll written.
  void read() { core_.read(next_); }

  /// Writes what read() brought; times as in Poll.
  void write(std::uint64_t nanoseconds, std::uint64_t missed);

 private:
  /// Which bits of an input port moved at this poll and the one before, and which signals each of them belongs to.
  struct InputPort {
    Port port;
    std::vector<std::vector<std::size_t>> signals;
    Bytes moved;
    Bytes movedBefore;
  };

  void index(const std::vector<Signal>& signals);
  void findChanged();
  void findMoved();
  void mark(const InputPort& input, const Bytes& now, const Bytes& before);
  void clearMarks();

  CoreSession& core_;
  SampleWriter& writer_;
  std::vector<Signal> signals_;
  std::vector<InputPort> inputs_;
  Sample next_;
  Sample shown_;
  bool isFirst_ = true;
  std::vector<Bytes> values_;
  std::vector<unsigned char> moved_;
  std::vector<std::size_t> changed_;
  std::vector<std::size_t> movedOtherwise_;
  std::vector<std::size_t> marked_;
  std::vector<unsigned char> isMarked_;
};

}  // namespace qor
