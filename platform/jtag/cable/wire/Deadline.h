// How long a whole exchange may take.
#pragma once

#include <chrono>

namespace QorRT {

using Seconds = std::chrono::duration<double>;

/// Begins when it is made.
struct Deadline {
  using Clock = std::chrono::steady_clock;

  explicit Deadline(Seconds time)
      : allowed(time), end(Clock::now() + std::chrono::ceil<Clock::duration>(time)) {}

  Seconds allowed;
  Clock::time_point end;
};

}  // namespace QorRT
