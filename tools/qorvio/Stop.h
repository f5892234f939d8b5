// Ctrl-C as a question that a loop can ask.
#pragma once

#include <chrono>

namespace tool {

/// From its construction to its end, SIGINT and SIGTERM end nothing by themselves.
class Stop {
 public:
  Stop();
  Stop(const Stop&) = delete;
  Stop& operator=(const Stop&) = delete;
  ~Stop();

  /// Whether one of them has come.
  bool asked() const;

  /// Sleeps until then, or until a moment after one of them has come.
  void sleepUntil(std::chrono::steady_clock::time_point time) const;
};

}  // namespace tool
