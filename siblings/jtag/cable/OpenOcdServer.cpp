#include "OpenOcdServer.h"

#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <chrono>
#include <stdexcept>
#include <system_error>
#include <thread>

namespace QorRT {
namespace {

using std::chrono::milliseconds, std::chrono::steady_clock;

constexpr milliseconds glance{20}, lastWords{200}, farewell{500};

[[noreturn]] void fail(const std::string& what, int error) {
  throw std::runtime_error(what + ": " + std::generic_category().message(error));
}

struct SpawnActions {
  SpawnActions() { posix_spawn_file_actions_init(&actions); }
  ~SpawnActions() { posix_spawn_file_actions_destroy(&actions); }
  SpawnActions(const SpawnActions&) = delete;
  SpawnActions& operator=(const SpawnActions&) = delete;
  posix_spawn_file_actions_t actions{};
};

// Quoted for Tcl, whatever the name is.
std::string quoted(const std::string& text) {
  std::string result = "\"";
  for (const char each : text) {
    if (std::string_view("\"\\$[").find(each) != std::string_view::npos) result += '\\';
    result += each;
  }
  return result + '"';
}

}  // namespace

OpenOcdServer::OpenOcdServer(const std::string& configFile) : log_(std::tmpfile()) {
  if (!log_) fail("no temporary file", errno);
  fcntl(fileno(log_.get()), F_SETFL, O_APPEND);  // the server shares our place in it
  std::string source = "source " + quoted(configFile);
  std::string ports = "bindto 127.0.0.1; telnet_port disabled; gdb_port disabled; tcl_port 0";
  std::string name = "openocd", command = "-c";
  const std::array<char*, 6> arguments{name.data(),    command.data(), source.data(),
                                       command.data(), ports.data(),   nullptr};
  SpawnActions spawn;
  posix_spawn_file_actions_addopen(&spawn.actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
  posix_spawn_file_actions_adddup2(&spawn.actions, fileno(log_.get()), STDOUT_FILENO);
  posix_spawn_file_actions_adddup2(&spawn.actions, fileno(log_.get()), STDERR_FILENO);
  const int error = posix_spawnp(&process_, name.c_str(), &spawn.actions, nullptr, arguments.data(), environ);
  if (error != 0) fail("openocd cannot be started", error);
}

OpenOcdServer::~OpenOcdServer() {
  if (!runs()) return;
  kill(process_, SIGTERM);
  const auto end = steady_clock::now() + farewell;
  while (runs() && steady_clock::now() < end) std::this_thread::sleep_for(glance);
  if (process_ < 0) return;
  kill(process_, SIGKILL);
  waitpid(process_, nullptr, 0);
}

std::unique_ptr<TcpStream> OpenOcdServer::connect(TcpStream::Seconds patience) {
  const auto end = steady_clock::now() + std::chrono::duration_cast<steady_clock::duration>(patience);
  while (runs()) {
    if (const std::string port = tclPort(); !port.empty())
      return std::make_unique<TcpStream>(Endpoint{"127.0.0.1", port}, patience);
    if (steady_clock::now() >= end) throw std::runtime_error("openocd opens no port; it says: " + errors());
    std::this_thread::sleep_for(glance);
  }
  throw std::runtime_error("openocd has ended; it says: " + errors());
}

// It closes its connections a moment before it ends.
void OpenOcdServer::requireRunning() {
  const auto end = steady_clock::now() + lastWords;
  while (runs() && steady_clock::now() < end) std::this_thread::sleep_for(glance);
  if (!runs()) throw std::runtime_error("openocd has ended; it says: " + errors());
}

bool OpenOcdServer::runs() {
  if (process_ >= 0 && waitpid(process_, nullptr, WNOHANG) == process_) process_ = -1;
  return process_ >= 0;
}

// As its log tells it; empty as long as it does not.
std::string OpenOcdServer::tclPort() const {
  constexpr std::string_view before = "Listening on port ", behind = " for tcl connections";
  for (const std::string& line : logLines()) {
    const std::size_t start = line.find(before), end = line.find(behind);
    if (start != line.npos && end != line.npos)
      return line.substr(start + before.size(), end - start - before.size());
  }
  return "";
}

// What its log tells of errors, or else the last line.
std::string OpenOcdServer::errors() const {
  constexpr std::string_view mark = "Error: ";
  std::string errors, last;
  for (const std::string& line : logLines()) {
    if (line.rfind(mark, 0) == 0) errors.append(errors.empty() ? "" : "; ").append(line.substr(mark.size()));
    if (!line.empty()) last = line;
  }
  return errors.empty() ? last : errors;
}

// The whole lines that are there, without the blanks at their ends.
std::vector<std::string> OpenOcdServer::logLines() const {
  std::vector<std::string> lines;
  std::string text;
  std::rewind(log_.get());
  for (int each = std::fgetc(log_.get()); each != EOF; each = std::fgetc(log_.get())) {
    if (each != '\n') {
      text += static_cast<char>(each);
      continue;
    }
    text.erase(text.find_last_not_of(" \r") + 1);
    lines.push_back(std::move(text));
    text.clear();
  }
  return lines;
}

}  // namespace QorRT
