// An OpenOCD server of our own.
#pragma once

#include <memory>
#include <string>

#include "platform/jtag/cable/wire/Stream.h"

namespace QorRT {

/// Runs from its construction to its destruction, or to the end of this process, whichever way that ends. It is spoken
/// to by its standard streams: there is no port that somebody else could use, unless the configuration opens one.
class OpenOcdServer {
 public:
  /// Throws runtime_error when openocd cannot be started. What is wrong with the configuration file shows when the
  /// server ends; see explain().
  OpenOcdServer(const std::string& configFile, StopFunction stop);
  ~OpenOcdServer();  // NOLINT(bugprone-exception-escape)
  OpenOcdServer(const OpenOcdServer&) = delete;
  OpenOcdServer& operator=(const OpenOcdServer&) = delete;

  /// It takes Tcl commands and gives their results, as its Tcl port would.
  Stream& stream() { return stream_; }

  /// The errors in its log or, without any, its last words.
  std::string errors();

  /// Throws runtime_error, with those errors, when the server has found that the chain is not as its configuration says,
  /// and uses it even so.
  void requireTrust();

  /// The warnings and errors that it has logged since the call before, a line each.
  std::string takeRemarks();

  /// After a failure of its stream that says `seen`: throws runtime_error with that, or that the server has ended, and
  /// errors().
  [[noreturn]] void explain(const std::string& seen);

 private:
  struct Process;

  bool endsWithin(std::chrono::milliseconds time);

  Stream stream_;
  std::unique_ptr<Process> process_;
};

}  // namespace QorRT
