#include <chrono>
#include <stdexcept>
#include <string>

#include "QorJtag.h"
#include "platform/jtag/Qor_SessionTable.h"

namespace QorRT {

QorJtagTargetLock::QorJtagTargetLock(unsigned session, unsigned timeout)
    : session_(Qor_SessionTable::instance().get(session)) {
  if (!session_->targetLock().tryLockFor(std::chrono::milliseconds(timeout))) {
    throw std::logic_error("session " + std::to_string(session) + ": the target lock was not free within " +
                           std::to_string(timeout) + " ms");
  }
  if (!session_->isClosed()) return;
  session_->targetLock().unlock();
  throwClosed(session);
}

QorJtagTargetLock::~QorJtagTargetLock() {
  session_->targetLock().unlock();
}

}  // namespace QorRT
