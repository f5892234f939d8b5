// The part of a cable URL behind its kind, such as "localhost:9000?board=my.toml&timeout=2".
#pragma once

#include <string>
#include <vector>

#include "platform/jtag/cable/wire/TcpStream.h"
#include "platform/jtag/cable/wire/WireDevice.h"

namespace QorRT {

struct WireUrl {
  Endpoint endpoint;                ///< empty when the URL names no server
  std::vector<DeviceEntry> board;   ///< of the file named by "board"; empty without one
  std::string config;               ///< "config": what a server of our own is started with
  TcpStream::Seconds timeout{5.0};  ///< "timeout": the longest wait without progress
};

/// Throws logic_error for a malformed URL, and what boardDevices() throws. `kind` is named in messages.
QOR_API WireUrl parseWireUrl(const std::string& kind, const std::string& rest);

}  // namespace QorRT
