// A terminal that is written to in place and reads keys.
#pragma once

#include <chrono>
#include <memory>
#include <string_view>

#include "os/StandardStreams.h"

namespace os {

/// A character, or one of those below.
using Key = int;
constexpr Key noKey = 0, keyUp = 0x100, keyDown = 0x101, keyPageUp = 0x102, keyPageDown = 0x103,
              keyHome = 0x104, keyEnd = 0x105, endOfKeys = 0x106;

struct TerminalSize {
  std::size_t rows;
  std::size_t columns;
};

/// From its construction to its end the terminal shows a screen of its own, without echo, cursor and line wrap;
/// afterwards what it showed before.
class Terminal {
 public:
  explicit Terminal(const Stop& stop);
  Terminal(const Terminal&) = delete;
  Terminal& operator=(const Terminal&) = delete;
  ~Terminal();

  /// Rows and columns that it has, now.
  TerminalSize size() const;

  /// Whether it was resized since the call before.
  bool takeResized();

  /// Writes text and escape sequences. False when a Stop was asked for and the terminal takes no more.
  bool write(std::string_view text) { return writeOutput(text, stop_); }

  /// Waits so long for a key, or until a signal comes: then and afterwards there is none.
  Key key(std::chrono::milliseconds wait);

 private:
  struct State;
  const Stop& stop_;
  std::unique_ptr<State> before_;
};

}  // namespace os
