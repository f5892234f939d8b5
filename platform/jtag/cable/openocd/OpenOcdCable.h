// A chain at an OpenOCD server, which drives the adapter; spoken to by its Tcl port.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "platform/jtag/cable/Qor_ServerLog.h"
#include "platform/jtag/cable/openocd/OpenOcdServer.h"
#include "platform/jtag/cable/openocd/OpenOcdText.h"
#include "platform/jtag/cable/wire/WireCable.h"

namespace QorRT {

/// A queue is one command, so that nobody else's scans come between; only one far above a megabyte goes in several.
class OpenOcdCable : public WireCable, public Qor_ServerLog {
 public:
  /// The server at the endpoint of the URL, or one of our own for its configuration file, whose chain nobody else uses.
  /// Throws runtime_error when there is no such server, or its chain does not fit the board file.
  OpenOcdCable(WireUrl url, StopFunction stop);
  ~OpenOcdCable() override;

  std::string takeRemarks() override { return server_ ? server_->takeRemarks() : ""; }

 private:
  using Scans = std::vector<Qor_Scan>::iterator;

  std::vector<WireDevice> connect() override;
  void exchange(std::vector<Qor_Scan>& scans, const Deadline& deadline) override;
  void disconnect() noexcept override;
  std::vector<WireDevice> startServer();
  std::vector<WireDevice> requireChain(const Deadline& deadline);
  bool isLeftOut(const Qor_Scan& scan);
  void runBatch(const std::vector<OpenOcdStep>& steps, Scans first, Scans end, const Deadline& deadline);
  std::string ask(const std::string& command, std::size_t most, const Deadline& deadline);

  std::unique_ptr<OpenOcdServer> server_;  // null for one that is not ours
  std::unique_ptr<Stream> connection_;     // to one that is not ours
  Stream* stream_ = nullptr;               // to either; null without a connection
  bool answers_ = false;                   // to the last that it was asked
  std::vector<OpenOcdTap> taps_;
  const std::string muteLog_;  // the name of a procedure: nobody else's on this server
};

}  // namespace QorRT
