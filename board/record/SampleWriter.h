// Files of samples: VCD, CSV, JSON lines.
#pragma once

#include <cstdint>
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "board/session/CoreSession.h"

namespace qor {

/// What a recorder writes of one poll.
struct Poll {
  std::uint64_t nanoseconds;         ///< since the recording began
  std::uint64_t missed;              ///< polls that should have been between this one and the one before
  const std::vector<Bytes>& values;  ///< one a signal
  const std::vector<std::size_t>& changed;  ///< the signals that differ from the poll before; at first all
  const std::vector<unsigned char>& moved;  ///< 1 for a signal with activity since the poll before
  const std::vector<std::size_t>& movedOtherwise;  ///< the signals whose `moved` differs from the poll before
};

/// Appends text to a file through a large buffer.
class OutputFile {
 public:
  /// Throws Failure when the file cannot be made.
  explicit OutputFile(const std::string& path);

  std::string& text() { return text_; }

  /// To be called now and then: writes the text when there is much of it. Throws Failure, naming the file.
  void spill() {
    if (text_.size() >= bufferSize) write();
  }

  /// Writes what is left and closes the file. Throws Failure.
  void close();

 private:
  static constexpr std::size_t bufferSize = 1 << 18;

  void write();
  [[noreturn]] void fail() const;

  std::string path_;
  std::string text_;
  std::unique_ptr<std::FILE, int (*)(std::FILE*)> file_;
};

class SampleWriter {
 public:
  virtual ~SampleWriter() = default;
  virtual void begin(const std::vector<Signal>& signals, const std::string& core) = 0;
  virtual void add(const Poll& poll) = 0;
  /// Polls that should have been between the last one and this time, the end of the recording; at least one.
  virtual void addMissed(std::uint64_t nanoseconds, std::uint64_t missed) = 0;
  virtual void end() = 0;
};

/// By the ending of the path: .vcd, .csv or .jsonl. Throws WrongUse for any other, Failure when the file cannot be
/// made.
std::unique_ptr<SampleWriter> sampleWriter(const std::string& path);

std::unique_ptr<SampleWriter> vcdWriter(const std::string& path);
std::unique_ptr<SampleWriter> csvWriter(const std::string& path);
std::unique_ptr<SampleWriter> jsonLinesWriter(const std::string& path);

}  // namespace qor
