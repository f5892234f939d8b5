#include <string>

#include "QorVIO.h"
#include "src/api/CoreAccess.h"
#include "src/core/PortCount.h"

using namespace QorRT;

unsigned QorVIO_writeValues(unsigned session, QOR_CORE_REF coreRef,
                            hash_map<std::string, std::string>** outputHashMap) {
  return onCore(session, coreRef, [&](QorVIO_Core& core) {
    require(outputHashMap != nullptr, "QorVIO_writeValues() arg. failed:outputHashMap!=0");
    require(*outputHashMap != nullptr, "QorVIO_writeValues() arg. failed:*outputHashMap!=0");
    core.writeValues(session, coreRef, *outputHashMap);
  });
}

unsigned QorVIO_readValues(unsigned session, QOR_CORE_REF coreRef,
                           hash_map<std::string, std::string>** inputHashMap) {
  return onCore(session, coreRef, [&](QorVIO_Core& core) {
    require(inputHashMap != nullptr, "QorVIO_readValues() arg. failed:inputHashMap!=0");
    require(*inputHashMap != nullptr, "QorVIO_readValues() arg. failed:*inputHashMap!=0");
    core.readValues(session, coreRef, *inputHashMap);
  });
}

unsigned QorVIO_setPortBits(unsigned session, QOR_CORE_REF coreRef, const unsigned char* asyncOutValueBits,
                            const unsigned char* asyncOutMaskBits, unsigned asyncOutDataBitCount,
                            const unsigned char* syncOutStepBits, const unsigned char* syncOutMaskBits,
                            unsigned syncOutDataBitCount) {
  return onCore(session, coreRef, [&](QorVIO_Core& core) {
    core.setPortBits(session, coreRef, asyncOutValueBits, asyncOutMaskBits, asyncOutDataBitCount,
                     syncOutStepBits, syncOutMaskBits, syncOutDataBitCount);
  });
}

unsigned QorVIO_getPortBits(unsigned session, QOR_CORE_REF coreRef, unsigned char* asyncInValueBits,
                            unsigned char* asyncInActivityUpBits, unsigned char* asyncInActivityDownBits,
                            unsigned asyncInDataBitCount, unsigned char* syncInValueBits,
                            unsigned char* syncInActivityUpBits, unsigned char* syncInActivityDownBits,
                            unsigned char* syncInSyncActivityUpBits,
                            unsigned char* syncInSyncActivityDownBits, unsigned syncInDataBitCount) {
  return onCore(session, coreRef, [&](QorVIO_Core& core) {
    requireCount(core, Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT, asyncInDataBitCount,
                 "QorVIO_getPortBits() arg. failed:(asyncInDataBitCount == "
                 "core->getCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT)) || "
                 "(asyncInDataBitCount == 0)");
    requireCount(core, Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT, syncInDataBitCount,
                 "QorVIO_getPortBits() arg. failed:(syncInDataBitCount == "
                 "core->getCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT)) || "
                 "(syncInDataBitCount == 0)");
    core.getPortBits(session, coreRef, asyncInValueBits, asyncInActivityUpBits, asyncInActivityDownBits,
                     asyncInDataBitCount, syncInValueBits, syncInActivityUpBits, syncInActivityDownBits,
                     syncInSyncActivityUpBits, syncInSyncActivityDownBits, syncInDataBitCount);
  });
}
