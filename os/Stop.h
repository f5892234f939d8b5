// Ctrl-C as a question that a loop can ask.
#pragma once

#include <signal.h>
#include <array>
#include <chrono>

namespace qor {

/// From its construction to its end, SIGINT and SIGTERM end nothing by themselves, nor does SIGHUP, which is left alone
/// where it is ignored (nohup). Afterwards they do what they did before.
class Stop {
 public:
  Stop();
  Stop(const Stop&) = delete;
  Stop& operator=(const Stop&) = delete;
  ~Stop();

  /// Whether one of them has come.
  bool asked() const;

  /// Sleeps until then, or until one of them comes.
  void sleepUntil(std::chrono::steady_clock::time_point due) const;

 private:
  std::array<struct sigaction, 3> before_{};
};

}  // namespace qor
