/// @file
/// libQorJtag: what a core library needs of a JTAG session.
///
/// Conventions
///
///  1. A session is an unsigned handle, never 0 and never used again after the session was closed.
///  2. Every function may be called by any thread.
///  3. Message types: 0x100 an error, 0x8000 the notice of an abort.
#pragma once

#include <memory>

#include "QorExport.h"

/// Hands a zero-terminated text to the session's message handler, on the calling thread. Returns 0, or
/// nonzero when the session is unknown (the text then goes where messages go by default) or its handler
/// failed. Throws nothing.
extern "C" QOR_API unsigned QorJtag_session_sendMessage(unsigned session, unsigned type, const char* text);

/// Runs what is queued towards the target; with nothing queued, does nothing. Returns 0. Throws when the
/// session is unknown or the link fails; the queue is empty afterwards in either case.
extern "C" QOR_API unsigned QorJtag_target_flush(unsigned session);

namespace QorRT {

class Qor_Session;

/// Holds the target lock of a session from construction to destruction. The lock is not recursive.
class QOR_API QorJtagTargetLock {
 public:
  /// Waits for the lock. Throws logic_error when the session is unknown or closed, or when `timeout`
  /// milliseconds pass first; the lock is not held then.
  QorJtagTargetLock(unsigned session, unsigned timeout);
  ~QorJtagTargetLock();

  QorJtagTargetLock(const QorJtagTargetLock&) = delete;
  QorJtagTargetLock& operator=(const QorJtagTargetLock&) = delete;

 private:
  std::shared_ptr<Qor_Session> session_;
};

}  // namespace QorRT
