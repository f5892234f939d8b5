#include "Terminal.h"

#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>
#include <algorithm>
#include <cstdio>

namespace tool {
namespace {

unsigned short rowsOfTerminal() {
  winsize size{};
  return ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_row != 0 ? size.ws_row : 24;
}

}  // namespace

Terminal::Terminal() {
  tcgetattr(STDIN_FILENO, &before_);
  termios raw = before_;
  raw.c_lflag &= ~static_cast<tcflag_t>(ICANON | ECHO);
  tcsetattr(STDIN_FILENO, TCSANOW, &raw);
  std::fputs("\033[?1049h\033[?25l\033[2J", stdout);
}

Terminal::~Terminal() {
  std::fputs("\033[?25h\033[?1049l", stdout);
  std::fflush(stdout);
  tcsetattr(STDIN_FILENO, TCSANOW, &before_);
}

void Terminal::show(const std::vector<std::string>& lines) {
  if (const unsigned short rows = rowsOfTerminal(); rows != rows_) {
    std::fputs("\033[2J", stdout);
    shown_.clear();
    rows_ = rows;
  }
  for (std::size_t i = 0; i < rows_ && i < std::max(lines.size(), shown_.size()); ++i) {
    const std::string line = i < lines.size() ? lines[i] : "";
    if (i < shown_.size() && shown_[i] == line) continue;
    std::printf("\033[%zu;1H%s\033[K", i + 1, line.c_str());
  }
  shown_ = lines;
  std::fflush(stdout);
}

char Terminal::key(std::chrono::milliseconds wait) {
  pollfd input{STDIN_FILENO, POLLIN, 0};
  char key = 0;
  if (poll(&input, 1, static_cast<int>(wait.count())) <= 0 || read(STDIN_FILENO, &key, 1) != 1) return 0;
  return key;
}

}  // namespace tool
