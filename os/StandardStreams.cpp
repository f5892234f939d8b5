#include "os/StandardStreams.h"

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>
#include <algorithm>
#include <cerrno>
#include <climits>
#include <stdexcept>

namespace os {
namespace {

// Waits in short naps, as Stop::sleepUntil does.
bool isReady(const Stop& stop) {
  pollfd output{STDOUT_FILENO, POLLOUT, 0};
  while (poll(&output, 1, 20) <= 0)
    if (stop.asked()) return false;
  return true;
}

}  // namespace

void openMissingStreams() {
  for (int descriptor = STDIN_FILENO; descriptor <= STDERR_FILENO; ++descriptor)
    if (fcntl(descriptor, F_GETFD) < 0) open("/dev/null", O_RDWR);  // takes the lowest number that is free
}

bool isTerminal(Stream stream) {
  return isatty(static_cast<int>(stream)) != 0;
}

bool writeOutput(std::string_view text, const Stop& stop) {
  while (!text.empty()) {
    if (!isReady(stop)) return false;
    // A pipe that is ready takes so much without blocking.
    const ssize_t count = write(STDOUT_FILENO, text.data(), std::min<std::size_t>(text.size(), PIPE_BUF));
    if (count >= 0) {
      text.remove_prefix(static_cast<std::size_t>(count));
    } else if (errno == EINTR) {
      if (stop.asked()) return false;
    } else if (errno != EAGAIN) {
      throw std::runtime_error("cannot write the output: stdout");
    }
  }
  return true;
}

}  // namespace os
