#include <memory>
#include <stdexcept>
#include <utility>

#include "QorVIO.h"
#include "src/api/CallFrame.h"
#include "src/api/CoreAccess.h"

using namespace QorRT;

namespace {

void removeWhateverIsAt(unsigned session, QOR_CORE_REF coreRef) {
  Qor_Core* core = Qor_CoreList::getCore(session, coreRef);
  if (core == nullptr) return;
  if (core->getCoreType() == vioCoreType)
    QorVIO_terminateCore(session, coreRef);
  else
    Qor_CoreList::removeCore(session, &core);
}

/// The list owns the core only from a normal return of addCore on.
void handOver(unsigned session, std::unique_ptr<QorVIO_Core> core) {
  Qor_CoreList::addCore(session, core.get());
  static_cast<void>(core.release());
}

}  // namespace

unsigned QorVIO_initCore(unsigned session, QOR_CORE_REF coreRef) {
  return callFrame(session, [&] {
    QorJtagTargetLock lock(session, lockTimeout);
    Qor_ByteBuffer statusWord = statusBuffer();
    removeWhateverIsAt(session, coreRef);
    QOR_CORE_INFO head = readVioStatus(session, coreRef, statusWord,
                                       "QorVIO_initCore() for the wrong core type or non-existant core.");
    auto core =
        std::make_unique<QorVIO_Core>(session, coreRef, head, statusWord.uPtr(), bitLength(statusWord));
    if (!core->initFromStatusWord(session))
      throw std::logic_error(addressText(coreRef) + ", core status word in not valid for a VIO core.");
    handOver(session, std::move(core));
    return callSucceeded;
  });
}

unsigned QorVIO_terminateCore(unsigned session, QOR_CORE_REF coreRef) {
  return callFrame(session, [&] {
    Qor_Core* core = Qor_CoreList::getCore(session, coreRef);
    if (core != nullptr && core->getCoreType() == vioCoreType) Qor_CoreList::removeCore(session, &core);
    return callSucceeded;
  });
}
