#include "os/Process.h"

#include <unistd.h>
#include <cerrno>
#include <ctime>

namespace os {

unsigned long processId() {
  return static_cast<unsigned long>(getpid());
}

std::string programName() {
  return program_invocation_short_name;
}

std::int64_t now() {
  return std::time(nullptr);
}

std::string localTime(std::int64_t seconds) {
  const std::time_t time = seconds;
  std::tm parts{};
  char text[40];
  localtime_r(&time, &parts);
  return {text, std::strftime(text, sizeof text, "%Y-%m-%d %H:%M:%S", &parts)};
}

}  // namespace os
