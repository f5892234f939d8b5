#include "board/session/Stop.h"

#include <algorithm>
#include <thread>

namespace qor {

bool sleepUntil(std::chrono::steady_clock::time_point due, const StopFunction& stop) {
  using Clock = std::chrono::steady_clock;
  constexpr std::chrono::milliseconds nap(20);
  for (;;) {
    if (stop && stop()) return false;
    const Clock::time_point now = Clock::now();
    if (now >= due) return true;
    std::this_thread::sleep_until(stop ? std::min(due, now + nap) : due);
  }
}

}  // namespace qor
