#include "platform/jtag/cable/openocd/OpenOcdServer.h"

#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>
#include <stdexcept>
#include <system_error>
#include <thread>

namespace QorRT {
namespace {

using std::chrono::milliseconds, std::chrono::steady_clock;

constexpr milliseconds glance{20}, startUp{10000}, lastWords{200}, farewell{1500};

[[noreturn]] void fail(const std::string& what, int error) {
  throw std::runtime_error(what + ": " + std::generic_category().message(error));
}

// Runs openocd with its arguments until it ends, or until nobody holds the other end of the pipe at 3 any more: so
// that it ends with its host, however that ends.
constexpr const char* keeper = R"(
trap "" INT QUIT
openocd "$@" 3<&- &
server=$!
{ read -r _; kill $server; sleep 0.5; kill -9 $server; } <&3 >/dev/null 2>&1 &
watch=$!
wait $server
kill -9 $watch
)";

/// What the new process gets instead of what its host has: files, signals.
class SpawnSettings {
 public:
  SpawnSettings(int log, int pipe) {
    posix_spawn_file_actions_init(&files_);
    posix_spawn_file_actions_addopen(&files_, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
    posix_spawn_file_actions_adddup2(&files_, log, STDOUT_FILENO);
    posix_spawn_file_actions_adddup2(&files_, log, STDERR_FILENO);
    posix_spawn_file_actions_adddup2(&files_, pipe, 3);
    posix_spawnattr_init(&attributes_);
    sigset_t none, all;
    sigemptyset(&none);
    sigfillset(&all);
    posix_spawnattr_setsigmask(&attributes_, &none);
    posix_spawnattr_setsigdefault(&attributes_, &all);
    posix_spawnattr_setflags(&attributes_, POSIX_SPAWN_SETSIGMASK | POSIX_SPAWN_SETSIGDEF);
  }
  ~SpawnSettings() {
    posix_spawnattr_destroy(&attributes_);
    posix_spawn_file_actions_destroy(&files_);
  }
  SpawnSettings(const SpawnSettings&) = delete;
  SpawnSettings& operator=(const SpawnSettings&) = delete;

  const posix_spawn_file_actions_t* files() const { return &files_; }
  const posix_spawnattr_t* attributes() const { return &attributes_; }

 private:
  posix_spawn_file_actions_t files_{};
  posix_spawnattr_t attributes_{};
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

// The arguments as the system wants them.
template <std::size_t count>
int spawnShell(pid_t& process, const SpawnSettings& settings, std::array<std::string, count> arguments) {
  std::array<char*, count + 1> pointers{};
  std::transform(arguments.begin(), arguments.end(), pointers.begin(),
                 [](std::string& each) { return each.data(); });
  return posix_spawn(&process, "/bin/sh", settings.files(), settings.attributes(), pointers.data(), environ);
}

}  // namespace

OpenOcdServer::OpenOcdServer(const std::string& configFile) : log_(std::tmpfile()) {
  if (!log_) fail("no temporary file", errno);
  fcntl(fileno(log_.get()), F_SETFL, O_APPEND);  // the server shares our place in it
  std::array<int, 2> ends{};
  if (pipe2(ends.data(), O_CLOEXEC) != 0) fail("no pipe", errno);
  const std::string ports = "bindto 127.0.0.1; telnet_port disabled; gdb_port disabled; tcl_port 0";
  const SpawnSettings settings(fileno(log_.get()), ends[0]);
  const int error = spawnShell<8>(
      process_, settings, {"sh", "-c", keeper, "openocd", "-c", ports, "-c", "source " + quoted(configFile)});
  close(ends[0]);
  lifeline_ = ends[1];
  if (error == 0) return;
  close(lifeline_);
  fail("openocd cannot be started", error);
}

OpenOcdServer::~OpenOcdServer() {
  close(lifeline_);
  const auto end = steady_clock::now() + farewell;
  while (runs() && steady_clock::now() < end) std::this_thread::sleep_for(glance);
}

std::unique_ptr<TcpStream> OpenOcdServer::connect(TcpStream::Seconds patience) {
  const auto end = steady_clock::now() + startUp;
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

// A host that ignores SIGCHLD has nobody to wait for: that tells the same.
bool OpenOcdServer::runs() {
  if (process_ >= 0 && waitpid(process_, nullptr, WNOHANG) != 0) process_ = -1;
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
