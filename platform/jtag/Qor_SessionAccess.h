// What libQorCore needs of a session beyond the public declarations.
#pragma once

#include "QorExport.h"
#include "Qor_Cable.h"
#include "platform/jtag/Qor_LinkRecord.h"

namespace QorRT {

/// The session's cable, for the holder of its target lock and as long as it has that. Throws logic_error
/// when the session is unknown or closed.
QOR_API Qor_Cable& sessionCable(unsigned session);

/// What the session keeps of its transfers, as sessionCable().
QOR_API Qor_LinkRecord& sessionRecord(unsigned session);

/// Has `hook` called once with the handle when the session is closed, without its target lock taken; the same
/// hook is kept once. Throws logic_error when the session is unknown or closed, and keeps nothing then.
QOR_API void onSessionClose(unsigned session, void (*hook)(unsigned session) noexcept);

}  // namespace QorRT
