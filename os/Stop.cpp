#include "os/Stop.h"

#include <signal.h>
#include <algorithm>
#include <array>
#include <thread>

namespace os {
namespace {

using Clock = std::chrono::steady_clock;

constexpr std::array<int, 3> endings{SIGINT, SIGTERM, SIGHUP};

volatile sig_atomic_t firstSignal = 0;

void handle(int signal) {
  if (firstSignal == 0) firstSignal = signal;
}

}  // namespace

struct Stop::Handlers {
  std::array<struct sigaction, endings.size()> actions{};
};

Stop::Stop() : before_(std::make_unique<Handlers>()) {
  firstSignal = 0;
  struct sigaction action {};
  action.sa_handler = handle;
  for (std::size_t i = 0; i < endings.size(); ++i) {
    sigaction(endings[i], nullptr, &before_->actions[i]);
    const bool staysIgnored = endings[i] == SIGHUP && before_->actions[i].sa_handler == SIG_IGN;
    if (!staysIgnored) sigaction(endings[i], &action, nullptr);
  }
}

Stop::~Stop() {
  for (std::size_t i = 0; i < endings.size(); ++i) sigaction(endings[i], &before_->actions[i], nullptr);
  firstSignal = 0;
}

bool isStopAsked() {
  return firstSignal != 0;
}

int Stop::signal() const {
  return firstSignal;
}

// In short naps: a signal that comes between the question and the sleep would otherwise be slept through.
void Stop::sleepUntil(Clock::time_point due) const {
  while (!asked() && Clock::now() < due)
    std::this_thread::sleep_until(std::min(due, Clock::now() + std::chrono::milliseconds(20)));
}

}  // namespace os
