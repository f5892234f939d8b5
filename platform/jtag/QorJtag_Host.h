/// @file
/// The host side of libQorJtag: open a session on a cable, listen to its messages, close it.
///
/// Conventions
///
///  1. A session is an unsigned handle, never 0 and never used again after the session was closed.
///  2. Every function may be called by any thread. Failures are standard exceptions whose text names what is
///     wrong.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "QorExport.h"
#include "QorJtag.h"
#include "Qor_Cable.h"

/// Receives each message of a session on the thread that sends it; `text` is valid during the call. A target
/// lock may be taken meanwhile, so a handler makes no call that takes one. What it throws goes no further.
using QorJtag_MessageHandler = std::function<void(unsigned type, const char* text)>;

/// Opens a session on the cable that the URL names: "sim:", "sim:BOARD.toml", "rbb:HOST:PORT",
/// "openocd:HOST:PORT" or "openocd:?config=FILE"; the last three may end with "?board=FILE" and
/// "timeout=SECONDS", with "&" between. Returns its handle. Throws, and opens nothing, when the URL is malformed
/// or of an unknown kind, or its cable cannot be opened. Of a server, every exchange has a deadline: the time of
/// the URL (5 s) and what its bits take at 20 kHz. A connection that breaks fails one call, and the next call opens
/// it anew.
extern "C" QOR_API unsigned QorJtag_session_open(const char* cableUrl);

namespace QorRT {

/// Opens the cable of a URL without a session, for a host that puts a cable of its own around it or has a `stop`
/// function, which is called by the thread that waits and must be of use as long as the cable. Throws as
/// QorJtag_session_open() does.
QOR_API std::unique_ptr<Qor_Cable> openCable(const char* url, StopFunction stop = {});

/// The text of a TOML file, for a host that parses files of its own: at most 1 MB, with no more than 16 levels of
/// nesting, so that its parser needs little of the stack. Throws invalid_argument, "FILE: what is wrong" or "FILE:LINE:
/// what is wrong", for a file without these bounds or that cannot be read, a directory, a FIFO or a device among them.
QOR_API std::string readTomlText(const std::string& path);

}  // namespace QorRT

/// Opens a session on a cable of the caller's own, which the session owns from then on. Throws on a null
/// cable.
extern "C" QOR_API unsigned QorJtag_session_openCable(std::unique_ptr<QorRT::Qor_Cable> cable);

/// Closes a session, its cable and its cores, after waiting for the call that has its target lock. Throws
/// when the session is unknown.
extern "C" QOR_API void QorJtag_session_close(unsigned session);

/// Replaces the session's message handler; an empty one restores the default, one line per message on stderr.
/// Throws when the session is unknown.
extern "C" QOR_API void QorJtag_session_setMessageHandler(unsigned session, QorJtag_MessageHandler handler);

/// What is on the session's chain, in device-index order: a copy into `devices`. Throws when the session
/// is unknown, with `devices` as it was.
extern "C" QOR_API void QorJtag_session_getDevices(unsigned session, std::vector<QorRT::Qor_Device>& devices);

/// What the transfers of a session have cost since it was opened. A transfer is one IR scan and one DR scan; one whose
/// answer is damaged or late is repeated, so that its caller sees nothing of it but the time.
struct QorJtag_Statistics {
  std::uint64_t transfers = 0;       ///< those that reached the cable, repeats among them
  std::uint64_t bits = 0;            ///< of their DR scans, without those of bypassed devices
  std::uint64_t nanoseconds = 0;     ///< spent in the cable
  std::uint64_t repeatsNoHub = 0;    ///< nothing on TDO began as a debug hub's answer does
  std::uint64_t repeatsNoHead = 0;   ///< the hub did not take the frame, or its answer did not begin as one
  std::uint64_t repeatsBadCrc = 0;   ///< the CRC of the answer was wrong
  std::uint64_t repeatsSlow = 0;     ///< the design clock was not ready in time
  std::uint64_t repeatsRefused = 0;  ///< an earlier write was not ready
};

/// Copies the session's counts into `statistics`. Throws when the session is unknown.
extern "C" QOR_API void QorJtag_session_getStatistics(unsigned session, QorJtag_Statistics& statistics);

/// A debug hub, and how many TCKs (0 to 2) its lines are later than the plain chain. Some device families register
/// them once more; the host finds this out when it reads a status word, and allows for it.
struct QorJtag_Hub {
  unsigned device_index;       ///< from the device nearest to TDO
  unsigned user_chain_number;  ///< 1 to 4
  unsigned lateTdi;            ///< TCKs
  unsigned lateTdo;            ///< TCKs

  /// How many TCKs an answer comes later than on a plain chain.
  unsigned late() const { return lateTdi + lateTdo; }
};

/// The hubs that have answered a status read in this session, by address: a copy into `hubs`. Throws when the session
/// is unknown, with `hubs` as it was.
extern "C" QOR_API void QorJtag_session_getHubs(unsigned session, std::vector<QorJtag_Hub>& hubs);
