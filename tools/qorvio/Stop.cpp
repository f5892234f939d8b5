#include "Stop.h"

#include <csignal>

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

}  // namespace tool
