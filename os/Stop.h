// Ctrl-C as a question that a loop can ask.
#pragma once

#include <chrono>
#include <memory>

namespace os {

/// From its construction to its end, SIGINT and SIGTERM end nothing by themselves, nor does SIGHUP, which is left alone
/// where it is ignored (nohup). Afterwards they do what they did before. One at a time.
class Stop {
 public:
  Stop();
  Stop(const Stop&) = delete;
  Stop& operator=(const Stop&) = delete;
  ~Stop();

  /// Whether one of them has come.
  bool asked() const { return signal() != 0; }

  /// The number of the first that has come; 0 when none has.
  int signal() const;

  /// Sleeps until then, or until one of them comes.
  void sleepUntil(std::chrono::steady_clock::time_point due) const;

 private:
  struct Handlers;
  std::unique_ptr<Handlers> before_;
};

/// Whether there is a Stop, and it is asked for.
bool isStopAsked();

}  // namespace os
