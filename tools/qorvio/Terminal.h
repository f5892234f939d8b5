// A terminal that shows lines in place and hands out keys.
#pragma once

#include <termios.h>
#include <chrono>
#include <string>
#include <vector>

namespace tool {

/// From its construction to its end the terminal shows a screen of its own, without echo; afterwards what it showed
/// before.
class Terminal {
 public:
  Terminal();
  Terminal(const Terminal&) = delete;
  Terminal& operator=(const Terminal&) = delete;
  ~Terminal();

  /// Shows the lines from the top, as many as there is room for. Only lines that changed are written.
  void show(const std::vector<std::string>& lines);

  /// Waits so long for a key; 0 when none came.
  char key(std::chrono::milliseconds wait);

 private:
  termios before_{};
  std::vector<std::string> shown_;
  unsigned short rows_ = 0;
};

}  // namespace tool
