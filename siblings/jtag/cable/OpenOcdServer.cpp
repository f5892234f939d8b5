#include "OpenOcdServer.h"

#include <fcntl.h>
#include <netinet/in.h>
#include <signal.h>
#include <spawn.h>
#include <sys/socket.h>
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

constexpr milliseconds glance{20}, farewell{2000};

[[noreturn]] void fail(const std::string& what, int error) {
  throw std::runtime_error(what + ": " + std::generic_category().message(error));
}

// A port that is free now. Someone else may take it before the server does, which then says so.
std::string freePort() {
  const int probe = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
  if (probe < 0) fail("no socket", errno);
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  socklen_t length = sizeof address;
  auto* const plain = reinterpret_cast<sockaddr*>(&address);  // the way of the socket interface
  const bool bound = bind(probe, plain, length) == 0 && getsockname(probe, plain, &length) == 0;
  const int error = errno;
  close(probe);
  if (!bound) fail("no free port", error);
  return std::to_string(ntohs(address.sin_port));
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

OpenOcdServer::OpenOcdServer(const std::string& configFile)
    : endpoint_{"127.0.0.1", freePort()}, log_(std::tmpfile()) {
  if (!log_) fail("no temporary file", errno);
  std::string source = "source " + quoted(configFile);
  std::string ports = "bindto 127.0.0.1; telnet_port disabled; gdb_port disabled; tcl_port " + endpoint_.port;
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
    try {
      return std::make_unique<TcpStream>(endpoint_, patience);
    } catch (const std::runtime_error&) {
      if (steady_clock::now() >= end) throw std::runtime_error("openocd opens no port; it says: " + errors());
    }
    std::this_thread::sleep_for(glance);
  }
  throw std::runtime_error("openocd has ended; it says: " + errors());
}

bool OpenOcdServer::runs() {
  if (process_ >= 0 && waitpid(process_, nullptr, WNOHANG) == process_) process_ = -1;
  return process_ >= 0;
}

// The lines of its log that tell of errors, or else its last line.
std::string OpenOcdServer::errors() const {
  std::string errors, last;
  std::array<char, 1024> line{};
  std::rewind(log_.get());
  while (std::fgets(line.data(), line.size(), log_.get()) != nullptr) {
    std::string text(line.data());
    while (!text.empty() && (text.back() == '\n' || text.back() == ' ')) text.pop_back();
    if (text.rfind("Error: ", 0) == 0) errors += (errors.empty() ? "" : "; ") + text.substr(7);
    if (!text.empty()) last = text;
  }
  return errors.empty() ? last : errors;
}

}  // namespace QorRT
