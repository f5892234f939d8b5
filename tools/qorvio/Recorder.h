// Polls a core and hands what changed to a writer, at the cable's full rate: a poll allocates nothing and looks at no
// signal whose bits stayed as they were.
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "CoreSession.h"
#include "SampleWriter.h"

namespace tool {

class Recorder {
 public:
  /// Core and writer must outlive the recorder. Begins the file.
  Recorder(CoreSession& core, std::vector<Signal> signals, SampleWriter& writer);

  /// Reads once; times as in Poll. Throws Failure, with nothing of the poll written.
  void read() { core_.read(next_); }

  /// Writes what read() brought.
  void write(std::uint64_t nanoseconds, std::uint64_t missed);

 private:
  using SignalsOfBits = std::vector<std::vector<std::size_t>>;

  void mark(Port port, const Bytes& first, const Bytes& second, bool differing);
  void findChanged();
  void findMoved();
  const SignalsOfBits& signalsOf(Port port) const { return bySignalBit_[port == Port::asyncIn ? 0 : 1]; }

  CoreSession& core_;
  SampleWriter& writer_;
  std::vector<Signal> signals_;
  std::array<SignalsOfBits, 2> bySignalBit_;
  Sample next_;
  Sample shown_;
  bool isFirst_ = true;
  std::vector<Bytes> values_;
  std::vector<std::size_t> marked_;
  std::vector<bool> isMarked_;
  std::vector<std::size_t> changed_;
  std::vector<bool> moved_;
};

}  // namespace tool
