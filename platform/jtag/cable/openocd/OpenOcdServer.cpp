#include "platform/jtag/cable/openocd/OpenOcdServer.h"

#include <algorithm>
#include <array>
#include <boost/asio/buffer.hpp>
#include <boost/asio/local/connect_pair.hpp>
#include <boost/asio/local/stream_protocol.hpp>
#include <boost/process/child.hpp>
#include <boost/process/environment.hpp>
#include <boost/process/extend.hpp>
#include <boost/process/group.hpp>
#include <boost/process/io.hpp>
#include <boost/process/pipe.hpp>
#include <filesystem>
#include <sstream>
#include <stdexcept>
#include <string_view>
#include <thread>
#include <utility>
#include <vector>

#include "platform/jtag/cable/wire/StreamLink.h"

namespace QorRT {
namespace {

namespace process = boost::process;
using Local = boost::asio::local::stream_protocol;
using std::chrono::milliseconds;

constexpr milliseconds pollInterval{5}, exitGrace{200}, stopTimeout{500}, exitTime{10000};
constexpr std::size_t logBytes = 16384;  // what is kept of its log

/// A program that inherits nothing but its standard streams.
struct InheritNothing : process::extend::handler {
  template <class Executor>
  void on_exec_setup(Executor&) const {
    os::inheritNothing();
  }
};

std::string programPath(const std::string& name) {
  for (const auto& folder : boost::this_process::path())
    if (std::filesystem::is_regular_file(folder / name)) return (folder / name).string();
  throw std::runtime_error(name + " cannot be found in the folders of PATH");
}

// Quoted for Tcl, whatever the name is.
std::string quoted(const std::string& text) {
  std::string result = "\"";
  for (const char each : text) {
    if (std::string_view("\"\\$[").find(each) != std::string_view::npos) result += '\\';
    result += each;
  }
  return result + '"';
}

/// Two sockets that are connected to each other: one for us, one for a program.
Socket pairOf(Socket& ours) {
  Local::socket first(ours.get_executor()), second(ours.get_executor());
  boost::asio::local::connect_pair(first, second);
  keepPrivate(ours, first, Local());
  Socket theirs(ours.get_executor());
  keepPrivate(theirs, second, Local());
  return theirs;
}

bool startsWith(std::string_view line, std::string_view start) {
  return line.substr(0, start.size()) == start;
}

/// What the lines of a log say of a failure.
class Complaints {
 public:
  void add(std::string line) {
    line.erase(line.find_last_not_of(" \t\r") + 1);
    if (startsWith(line, "Error: ")) errors_.push_back(line.substr(7));
    for (const char* const start :
         {"Error:", "Warn :", "Info :", "Debug:", "Open On-Chip", "Licensed under", "For bug", "\t"})
      if (startsWith(line, start)) return;
    if (!line.empty()) others_.push_back(std::move(line));
  }

  /// The errors or, without any, the last lines.
  std::string text() const {
    const std::vector<std::string>& lines = errors_.empty() ? others_ : errors_;
    std::string text;
    for (std::size_t i = lines.size() - std::min(lines.size(), mostLines); i < lines.size(); ++i)
      text.append(text.empty() ? "" : "; ").append(lines[i]);
    return text;
  }

 private:
  static constexpr std::size_t mostLines = 4;

  std::vector<std::string> errors_, others_;
};

}  // namespace

struct OpenOcdServer::Process {
  explicit Process(boost::asio::io_context& io) : log(io) {}

  // Reads the log whenever the connection is served, so that the server never waits for it.
  void drain() {
    log.async_read_some(boost::asio::buffer(block),
                        [this](boost::system::error_code error, std::size_t count) {
                          isClosed = error.failed();
                          if (isClosed) return;
                          for (std::string* each : {&text, &fresh}) {
                            each->append(block.data(), count);
                            if (each->size() > 2 * logBytes) each->erase(0, each->size() - logBytes);
                          }
                          drain();
                        });
  }

  Socket log;
  std::array<char, 4096> block{};
  std::string text;       // the end of the log
  std::string fresh;      // what of it has come since takeRemarks()
  bool isClosed = false;  // the server is about to end
  process::child child;
};

OpenOcdServer::OpenOcdServer(const std::string& configFile, StopFunction stop)
    : stream_(std::make_unique<Stream::Link>(), "openocd", std::move(stop)),
      process_(std::make_unique<Process>(stream_.link().io)) {
  Socket talk = pairOf(stream_.link().socket), log = pairOf(process_->log);
  process::pipe in(os::privateCopy(talk.native_handle()), -1), out(-1, talk.release()),
      errors(-1, log.release());
  const std::string ports = "bindto 127.0.0.1; telnet_port disabled; gdb_port disabled; tcl_port pipe";
  process::group ownGroup;  // Ctrl-C in the terminal is for the host alone
  std::error_code error;
  process_->child = process::child(programPath("openocd"), "-c", ports, "-c", "source " + quoted(configFile),
                                   "-c", "catch {tcl_port pipe}", process::std_in<in, process::std_out> out,
                                   process::std_err > errors, ownGroup, InheritNothing(), error);
  if (error) throw std::runtime_error("openocd cannot be started: " + error.message());
  ownGroup.detach();
  process_->drain();
}

// The end of its input ends it, though a copy of this process may have the sockets too.
// What could throw is out of memory only, and then there is no way on.
OpenOcdServer::~OpenOcdServer() {  // NOLINT(bugprone-exception-escape)
  boost::system::error_code ignored;
  stream_.link().socket.shutdown(Socket::shutdown_both, ignored);
  std::error_code none;
  if (!endsWithin(stopTimeout)) process_->child.terminate(none);
  process_->log.close(ignored);
  stream_.link().io.restart();
  stream_.link().io.poll();  // the reading of the log refers to us
}

// A host that ignores SIGCHLD has nobody to wait for: that says the same. A server that has closed its log gets more time:
// it does end, but the machine may be busy.
bool OpenOcdServer::endsWithin(milliseconds time) {
  const auto begin = Deadline::Clock::now();
  std::error_code none;
  while (process_->child.running(none)) {
    if (Deadline::Clock::now() >= begin + (process_->isClosed ? exitTime : time)) return false;
    std::this_thread::sleep_for(pollInterval);
    stream_.link().io.restart();
    stream_.link().io.poll();
  }
  return true;
}

void OpenOcdServer::explain(const std::string& seen) {
  const std::string what = endsWithin(exitGrace) ? "openocd has ended" : seen, said = errors();
  throw std::runtime_error(what + (said.empty() ? "" : "; it says: ") + said);
}

void OpenOcdServer::requireTrust() {
  const std::string said = errors();
  if (process_->text.find("Bypassing JTAG setup events due to errors") != std::string::npos)
    throw std::runtime_error("openocd does not trust the chain; it says: " + said);
}

std::string OpenOcdServer::errors() {
  stream_.link().io.restart();
  stream_.link().io.poll();
  Complaints complaints;
  std::istringstream lines(process_->text);
  for (std::string line; std::getline(lines, line);) complaints.add(std::move(line));
  return complaints.text();
}

std::string OpenOcdServer::takeRemarks() {
  stream_.link().io.restart();
  stream_.link().io.poll();
  std::string remarks;
  std::istringstream lines(std::exchange(process_->fresh, {}));
  for (std::string line; std::getline(lines, line);)
    if (startsWith(line, "Warn :") || startsWith(line, "Error:")) remarks += line + '\n';
  return remarks;
}

}  // namespace QorRT
