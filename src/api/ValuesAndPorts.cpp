#include <string>

#include "QorVIO.h"
#include "src/api/CallFrame.h"
#include "src/api/CoreAccess.h"

using namespace QorRT;

namespace {

void requireInputCount(const QorVIO_Core& core, unsigned type, unsigned count, const char* text) {
  require(count == core.getCorePhysicalSignalCount(type) || count == 0, text);
}

}  // namespace

unsigned QorVIO_writeValues(unsigned session, QOR_CORE_REF coreRef,
                            hash_map<std::string, std::string>** outputHashMap) {
  return callFrame(session, [&] {
    QorJtagTargetLock lock(session, lockTimeout);
    QorVIO_Core& core = getVioCore(session, coreRef);
    require(outputHashMap != nullptr, "QorVIO_writeValues() arg. failed:outputHashMap!=0");
    require(*outputHashMap != nullptr, "QorVIO_writeValues() arg. failed:*outputHashMap!=0");
    core.writeValues(session, coreRef, *outputHashMap);
    return callSucceeded;
  });
}

unsigned QorVIO_readValues(unsigned session, QOR_CORE_REF coreRef,
                           hash_map<std::string, std::string>** inputHashMap) {
  return callFrame(session, [&] {
    QorJtagTargetLock lock(session, lockTimeout);
    QorVIO_Core& core = getVioCore(session, coreRef);
    require(inputHashMap != nullptr, "QorVIO_readValues() arg. failed:inputHashMap!=0");
    require(*inputHashMap != nullptr, "QorVIO_readValues() arg. failed:*inputHashMap!=0");
    core.readValues(session, coreRef, *inputHashMap);
    return callSucceeded;
  });
}

unsigned QorVIO_setPortBits(unsigned session, QOR_CORE_REF coreRef, const unsigned char* asyncOutValueBits,
                            const unsigned char* asyncOutMaskBits, unsigned asyncOutDataBitCount,
                            const unsigned char* syncOutStepBits, const unsigned char* syncOutMaskBits,
                            unsigned syncOutDataBitCount) {
  return callFrame(session, [&] {
    QorJtagTargetLock lock(session, lockTimeout);
    QorVIO_Core& core = getVioCore(session, coreRef);
    core.setPortBits(session, coreRef, asyncOutValueBits, asyncOutMaskBits, asyncOutDataBitCount,
                     syncOutStepBits, syncOutMaskBits, syncOutDataBitCount);
    return callSucceeded;
  });
}

unsigned QorVIO_getPortBits(unsigned session, QOR_CORE_REF coreRef, unsigned char* asyncInValueBits,
                            unsigned char* asyncInActivityUpBits, unsigned char* asyncInActivityDownBits,
                            unsigned asyncInDataBitCount, unsigned char* syncInValueBits,
                            unsigned char* syncInActivityUpBits, unsigned char* syncInActivityDownBits,
                            unsigned char* syncInSyncActivityUpBits,
                            unsigned char* syncInSyncActivityDownBits, unsigned syncInDataBitCount) {
  return callFrame(session, [&] {
    QorJtagTargetLock lock(session, lockTimeout);
    QorVIO_Core& core = getVioCore(session, coreRef);
    requireInputCount(core, Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT, asyncInDataBitCount,
                      "QorVIO_getPortBits() arg. failed:(asyncInDataBitCount == "
                      "core->getCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT)) || "
                      "(asyncInDataBitCount == 0)");
    requireInputCount(core, Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT, syncInDataBitCount,
                      "QorVIO_getPortBits() arg. failed:(syncInDataBitCount == "
                      "core->getCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT)) || "
                      "(syncInDataBitCount == 0)");
    core.getPortBits(session, coreRef, asyncInValueBits, asyncInActivityUpBits, asyncInActivityDownBits,
                     asyncInDataBitCount, syncInValueBits, syncInActivityUpBits, syncInActivityDownBits,
                     syncInSyncActivityUpBits, syncInSyncActivityDownBits, syncInDataBitCount);
    return callSucceeded;
  });
}
