// How long a whole exchange may take.
#pragma once

#include <chrono>

namespace QorRT {

using Seconds = std::chrono::duration<double>;

/// A host that is to stop gives no exchange up before: enough for a server that answers, so that such a host can still
/// put back what it changed.
constexpr std::chrono::milliseconds leastTime{300};

/// Begins when it is made.
struct Deadline {
  using Clock = std::chrono::steady_clock;

  explicit Deadline(Seconds time)
      : allowed(time), end(Clock::now() + std::chrono::ceil<Clock::duration>(time)) {}

  /// Whether a host that is to stop may give the exchange up.
  bool mayStop() const { return end - allowed + leastTime < Clock::now(); }

  Seconds allowed;
  Clock::time_point end;
};

}  // namespace QorRT
