/// @file
/// The host side of libQorJtag: open a session on a cable, listen to its messages, close it.
///
/// Conventions
///
///  1. A session is an unsigned handle, never 0 and never used again after the session was closed.
///  2. Every function may be called by any thread. Failures are standard exceptions whose text names what is
///     wrong.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "QorExport.h"
#include "QorJtag.h"
#include "Qor_Cable.h"

/// Receives each message of a session on the thread that sends it; `text` is valid during the call. A target
/// lock may be held meanwhile, so a handler makes no call that takes one. What it throws goes no further.
using QorJtag_MessageHandler = std::function<void(unsigned type, const char* text)>;

/// Opens a session on the cable that the URL names: "sim:", "sim:BOARD.toml", "rbb:HOST:PORT",
/// "openocd:HOST:PORT" or "openocd:?config=FILE"; behind the last three may stand "?board=FILE" and
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
/// nesting, so that its parser needs little of the stack. Throws runtime_error, "FILE: what is wrong" or "FILE:LINE:
/// what is wrong", for a file without these bounds or that cannot be read, a directory, a FIFO or a device among them.
QOR_API std::string readTomlText(const std::string& path);

}  // namespace QorRT

/// Opens a session on a cable of the caller's own, which the session owns from then on. Throws on a null
/// cable.
extern "C" QOR_API unsigned QorJtag_session_openCable(std::unique_ptr<QorRT::Qor_Cable> cable);

/// Closes a session, its cable and its cores, after waiting for the call that holds its target lock. Throws
/// when the session is unknown.
extern "C" QOR_API void QorJtag_session_close(unsigned session);

/// Replaces the session's message handler; an empty one restores the default, one line a message on stderr.
/// Throws when the session is unknown.
extern "C" QOR_API void QorJtag_session_setMessageHandler(unsigned session, QorJtag_MessageHandler handler);

/// What stands on the session's chain, in device-index order: a copy into `devices`. Throws when the session
/// is unknown, with `devices` as it was.
extern "C" QOR_API void QorJtag_session_getDevices(unsigned session, std::vector<QorRT::Qor_Device>& devices);
