// The part of a cable URL after its kind, such as "localhost:9000?board=my.toml&timeout=2".
#pragma once

#include <string>
#include <vector>

#include "platform/jtag/cable/wire/Stream.h"

namespace QorRT {

struct WireUrl {
  Endpoint endpoint;     ///< empty when the URL names no server
  std::string board;     ///< "board": a board file; empty without one
  std::string config;    ///< "config": what a server of our own is started with
  Seconds timeout{5.0};  ///< "timeout": beside the time that the bits take, the longest wait for an answer
};

/// In the values of options "%26" and the like are the bytes with these hexadecimal numbers. Throws logic_error
/// for a malformed URL and for an option that is not among `options`. `kind` is named in messages.
WireUrl parseWireUrl(const std::string& kind, const std::string& rest,
                     const std::vector<std::string>& options);

}  // namespace QorRT
