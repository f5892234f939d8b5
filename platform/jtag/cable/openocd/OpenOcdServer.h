// An OpenOCD server of our own.
#pragma once

#include <sys/types.h>

#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "QorExport.h"
#include "platform/jtag/cable/wire/TcpStream.h"

namespace QorRT {

/// Runs from its construction to its destruction, or to the end of this process, whichever way it ends. Its Tcl port
/// is a free loopback port, its other ports are closed, unless the configuration sets them.
class QOR_API OpenOcdServer {
 public:
  /// Throws runtime_error when no server can be started. What is wrong with the configuration file shows when
  /// the server ends; see connect().
  explicit OpenOcdServer(const std::string& configFile);
  ~OpenOcdServer();
  OpenOcdServer(const OpenOcdServer&) = delete;
  OpenOcdServer& operator=(const OpenOcdServer&) = delete;

  /// A connection to its Tcl port, as soon as it takes one. Throws runtime_error, with the last errors of the
  /// server's log, when it ends instead, or when it takes too long. `patience` is the connection's.
  std::unique_ptr<TcpStream> connect(TcpStream::Seconds patience);

  /// After a broken connection: throws, as connect() does, when the server has ended or ends now.
  void requireRunning();

  /// The port of connect(); empty as long as the server does not listen.
  std::string tclPort() const;

 private:
  bool runs();
  std::string errors() const;
  std::vector<std::string> logLines() const;

  struct CloseFile {
    void operator()(std::FILE* file) const { std::fclose(file); }
  };

  std::unique_ptr<std::FILE, CloseFile> log_;  // has no name, and goes with us
  int lifeline_ = -1;   // of a pipe: the server ends when it is closed, by us or by our end
  pid_t process_ = -1;  // of the shell that keeps the server; -1 when it has ended
};

}  // namespace QorRT
