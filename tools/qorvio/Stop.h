// Ctrl-C as a question that a loop can ask.
#pragma once

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
};

}  // namespace tool
