// A chain behind an OpenOCD server, which drives the adapter; spoken to by its Tcl port.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "QorExport.h"
#include "platform/jtag/cable/openocd/OpenOcdServer.h"
#include "platform/jtag/cable/openocd/OpenOcdText.h"
#include "platform/jtag/cable/wire/WireCable.h"
#include "platform/jtag/cable/wire/WireUrl.h"

namespace QorRT {

/// A queue is one command, so that nobody else's come between; only one far above a megabyte goes in several.
class QOR_API OpenOcdCable : public WireCable {
 public:
  /// The server at the endpoint of the URL, or one of our own for its configuration file. Throws runtime_error
  /// when there is no such server, or its chain does not fit the board file.
  explicit OpenOcdCable(WireUrl url);
  ~OpenOcdCable() override;

 private:
  std::vector<WireDevice> connect() override;
  void exchange(std::vector<Qor_Scan>& scans) override;
  void disconnect() noexcept override;
  std::unique_ptr<TcpStream> reach();
  std::string commandFor(const std::string& commands);
  std::string ask(const std::string& command, std::size_t tcks = 0);

  WireUrl url_;
  std::unique_ptr<OpenOcdServer> server_;  // null for one that is not ours
  std::unique_ptr<TcpStream> stream_;      // null without a connection
  bool answers_ = false;                   // to the last that it was asked
  std::vector<OpenOcdTap> taps_;
  std::string procedure_;  // its name: nobody else's on this server
  std::string known_;      // what it does there; empty when it is not there
};

}  // namespace QorRT
