#include "Stop.h"

#include <algorithm>
#include <csignal>
#include <thread>

namespace tool {
namespace {

volatile std::sig_atomic_t stopAsked = 0;

void handle(int) {
  stopAsked = 1;
}

void setHandlers(void (*handler)(int)) {
  struct sigaction action {};
  action.sa_handler = handler;
  sigaction(SIGINT, &action, nullptr);
  sigaction(SIGTERM, &action, nullptr);
}

}  // namespace

Stop::Stop() {
  stopAsked = 0;
  setHandlers(handle);
}

Stop::~Stop() {
  setHandlers(SIG_DFL);
}

bool Stop::asked() const {
  return stopAsked != 0;
}

// In slices: the library's sleep goes on after a signal.
void Stop::sleepUntil(std::chrono::steady_clock::time_point time) const {
  constexpr std::chrono::milliseconds slice(20);
  for (auto now = std::chrono::steady_clock::now(); now < time && !asked();
       now = std::chrono::steady_clock::now())
    std::this_thread::sleep_until(std::min(now + slice, time));
}

}  // namespace tool
