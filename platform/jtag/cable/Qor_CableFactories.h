// The factories of the table of cable URLs: each opens the cable that the rest of a URL describes.
#pragma once

#include <memory>
#include <string>

#include "Qor_Cable.h"

namespace QorRT {

/// `sim:` the demo board; `sim:board.toml` the board that the file describes. Throws with what is wrong in
/// the file.
std::unique_ptr<Qor_Cable> openSimulatedCable(const std::string& boardFile, StopFunction stop);

/// `rbb:HOST:PORT` a remote_bitbang server; after a "?" there may be `board=FILE` and `timeout=SECONDS`, with "&"
/// between. Throws when the URL, the server or the chain is not right. `stop` may be empty, and ends every wait.
std::unique_ptr<Qor_Cable> openBitbangCable(const std::string& rest, StopFunction stop);

/// `openocd:HOST:PORT` the Tcl port of an OpenOCD server; `openocd:?config=FILE` a server of our own, which ends
/// with the cable. The same options and failures.
std::unique_ptr<Qor_Cable> openOpenOcdCable(const std::string& rest, StopFunction stop);

}  // namespace QorRT
