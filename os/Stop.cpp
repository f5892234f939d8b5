#include "os/Stop.h"

#include <algorithm>
#include <csignal>
#include <thread>

namespace qor {
namespace {

using Clock = std::chrono::steady_clock;

constexpr std::array<int, 3> endings{SIGINT, SIGTERM, SIGHUP};

volatile std::sig_atomic_t stopAsked = 0;

void handle(int) {
  stopAsked = 1;
}

}  // namespace

Stop::Stop() {
  stopAsked = 0;
  struct sigaction action {};
  action.sa_handler = handle;
  for (std::size_t i = 0; i < endings.size(); ++i) {
    sigaction(endings[i], nullptr, &before_[i]);
    const bool staysIgnored = endings[i] == SIGHUP && before_[i].sa_handler == SIG_IGN;
    if (!staysIgnored) sigaction(endings[i], &action, nullptr);
  }
}

Stop::~Stop() {
  for (std::size_t i = 0; i < endings.size(); ++i) sigaction(endings[i], &before_[i], nullptr);
}

bool Stop::asked() const {
  return stopAsked != 0;
}

// In short naps: a signal that comes between the question and the sleep would otherwise be slept through.
void Stop::sleepUntil(Clock::time_point due) const {
  while (!asked() && Clock::now() < due)
    std::this_thread::sleep_until(std::min(due, Clock::now() + std::chrono::milliseconds(20)));
}

}  // namespace qor
