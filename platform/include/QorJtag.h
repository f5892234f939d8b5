/// @file
/// libQorJtag: the part of a JTAG session that libraries for cores use.
///
/// Conventions
///
///  1. A session is an unsigned handle. It is never 0, and never used again after the session was closed.
///  2. Any thread may call any function.
///  3. Message types: 0x100 is an error, 0x8000 is the notice of an abort.
#pragma once

#include <memory>

#include "QorExport.h"

/// Passes a zero-terminated text (in) to the session's message handler, on the calling thread. Returns 0;
/// or nonzero if the handler failed, or if the session is unknown: the text is then printed to standard
/// error, as for a session without a handler. Throws nothing.
extern "C" QOR_API unsigned QorJtag_session_sendMessage(unsigned session, unsigned type, const char* text);

/// Runs the queued scans of the session; without any, it does nothing. Returns 0. Throws if the session is
/// unknown or the link fails. The queue is empty afterwards in each case.
extern "C" QOR_API unsigned QorJtag_target_flush(unsigned session);

namespace QorRT {

class Qor_Session;

/// Owns the target lock of a session from construction to destruction. The lock is not recursive.
class QOR_API QorJtagTargetLock {
 public:
  /// Waits for the lock, at most `timeout` milliseconds. Throws logic_error, without the lock, if the time
  /// has passed or the session is unknown or closed.
  QorJtagTargetLock(unsigned session, unsigned timeout);
  ~QorJtagTargetLock();

  QorJtagTargetLock(const QorJtagTargetLock&) = delete;
  QorJtagTargetLock& operator=(const QorJtagTargetLock&) = delete;

 private:
  std::shared_ptr<Qor_Session> session_;
};

}  // namespace QorRT
