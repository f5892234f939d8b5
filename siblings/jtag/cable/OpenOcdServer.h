// An OpenOCD server of our own.
#pragma once

#include <sys/types.h>

#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "QorExport.h"
#include "TcpStream.h"

namespace QorRT {

/// Runs from its construction to its destruction, with its Tcl port on a free loopback port and its other ports
/// closed.
class QOR_API OpenOcdServer {
 public:
  /// Throws runtime_error when no server can be started. What is wrong with the configuration file shows when
  /// the server ends; see connect().
  explicit OpenOcdServer(const std::string& configFile);
  ~OpenOcdServer();
  OpenOcdServer(const OpenOcdServer&) = delete;
  OpenOcdServer& operator=(const OpenOcdServer&) = delete;

  /// A connection to its Tcl port, as soon as it takes one. Throws runtime_error, with the last errors of the
  /// server's log, when it ends instead, or when `patience` passes first.
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
  pid_t process_ = -1;
};

}  // namespace QorRT
