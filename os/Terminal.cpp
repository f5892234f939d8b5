#include "os/Terminal.h"

#include <poll.h>
#include <signal.h>
#include <sys/ioctl.h>
#include <termios.h>
#include <unistd.h>
#include <cerrno>
#include <exception>
#include <string>
#include <utility>

namespace os {
namespace {

using std::chrono::milliseconds;

constexpr Key escape = '\033';

volatile sig_atomic_t isResized = 0;

void handleResize(int) {
  isResized = 1;
}

Key nextByte(milliseconds wait) {
  pollfd input{STDIN_FILENO, POLLIN, 0};
  if (poll(&input, 1, static_cast<int>(wait.count())) <= 0) return noKey;
  unsigned char byte = 0;
  const ssize_t count = read(STDIN_FILENO, &byte, 1);
  if (count == 1) return byte;
  return count < 0 && errno == EINTR ? noKey : endOfKeys;
}

// What the terminal sends after ESC for the keys that send more than a character.
Key keyOf(const std::string& sequence) {
  constexpr std::pair<const char*, Key> keys[] = {{"[A", keyUp},   {"OA", keyUp},      {"[B", keyDown},
                                                  {"OB", keyDown}, {"[5~", keyPageUp}, {"[6~", keyPageDown},
                                                  {"[H", keyHome}, {"OH", keyHome},    {"[1~", keyHome},
                                                  {"[F", keyEnd},  {"OF", keyEnd},     {"[4~", keyEnd}};
  for (const auto& [text, key] : keys)
    if (sequence == text) return key;
  return noKey;
}

Key keyBehindEscape() {
  constexpr milliseconds together(25);  // the bytes of one key come together
  std::string sequence;
  for (Key byte = nextByte(together); byte != noKey && byte != endOfKeys; byte = nextByte(together)) {
    sequence += static_cast<char>(byte);
    if (sequence.size() > 1 && byte >= '@' && byte <= '~') break;
  }
  return keyOf(sequence);
}

}  // namespace

struct Terminal::State {
  termios modes{};
  struct sigaction resize {};
};

Terminal::Terminal(const Stop& stop) : stop_(stop), before_(std::make_unique<State>()) {
  write("\033[?1049h\033[?25l\033[?7l\033[2J");  // first: a terminal that takes it not is left as it is
  tcgetattr(STDIN_FILENO, &before_->modes);
  termios raw = before_->modes;
  raw.c_lflag &= ~static_cast<tcflag_t>(ICANON | ECHO);
  // With either, the shell would get the terminal as it is.
  raw.c_cc[VSUSP] = _POSIX_VDISABLE;
  raw.c_cc[VQUIT] = _POSIX_VDISABLE;
  tcsetattr(STDIN_FILENO, TCSANOW, &raw);
  struct sigaction action {};
  action.sa_handler = handleResize;
  action.sa_flags = SA_RESTART;
  sigaction(SIGWINCH, &action, &before_->resize);
}

Terminal::~Terminal() {
  sigaction(SIGWINCH, &before_->resize, nullptr);
  tcsetattr(STDIN_FILENO, TCSANOW, &before_->modes);
  try {
    write("\033[?7h\033[?25h\033[?1049l");
  } catch (const std::exception&) {
    return;  // a terminal that is gone has nothing to show
  }
}

TerminalSize Terminal::size() const {
  winsize size{};
  if (ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) != 0) size = {};
  return {size.ws_row != 0 ? size.ws_row : std::size_t{24}, size.ws_col != 0 ? size.ws_col : std::size_t{80}};
}

bool Terminal::takeResized() {
  if (isResized == 0) return false;
  isResized = 0;
  return true;
}

Key Terminal::key(milliseconds wait) {
  const Key byte = nextByte(wait);
  return byte == escape ? keyBehindEscape() : byte;
}

}  // namespace os
