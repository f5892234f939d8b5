// Whole ports as raw bits: setPortBits and getPortBits.
#include <string>
#include <utility>

#include "QorUtil.h"
#include "QorVIO_Core.h"
#include "src/core/PortCount.h"
#include "src/port/StepPlanes.h"

namespace QorRT {

namespace {

std::string portString(const unsigned char* bits, unsigned width) {
  std::string text;
  return Qor_NumberUtil::bin2ReverseBinStr(bits, width, text);
}

void deliver(const std::string& port, unsigned char* bits) {
  if (bits != nullptr) Qor_NumberUtil::reverseBinStr2Bin(port, bits);
}

}  // namespace

void QorVIO_Core::setPortBits(unsigned session, QOR_CORE_REF coreRef, const unsigned char* asyncOutValueBits,
                              const unsigned char* asyncOutMaskBits, unsigned asyncOutDataBitCount,
                              const unsigned char* syncOutStepBits, const unsigned char* syncOutMaskBits,
                              unsigned syncOutDataBitCount) {
  const bool hasAsync = asyncOutDataBitCount != 0;
  const bool hasSync = syncOutDataBitCount != 0;
  requireCount(*this, Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_OUTPUT, asyncOutDataBitCount,
               "QorVIO_setPortBits() arg. failed:(asyncOutDataBitCount == "
               "core->getCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_OUTPUT)) || "
               "(asyncOutDataBitCount == 0)");
  requireCount(*this, Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT, syncOutDataBitCount,
               "QorVIO_setPortBits() arg. failed:(syncOutDataBitCount == "
               "core->getCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT)) || "
               "(syncOutDataBitCount == 0)");
  require(!hasAsync || asyncOutValueBits != nullptr, "QorVIO_setPortBits() arg. failed:asyncOutValueBits!=0");
  require(!hasAsync || asyncOutMaskBits != nullptr, "QorVIO_setPortBits() arg. failed:asyncOutMaskBits!=0");
  require(!hasSync || syncOutStepBits != nullptr, "QorVIO_setPortBits() arg. failed:syncOutStepBits!=0");
  require(!hasSync || syncOutMaskBits != nullptr, "QorVIO_setPortBits() arg. failed:syncOutMaskBits!=0");

  // Whatever can fail comes before anything is staged.
  std::string asyncValues = portString(asyncOutValueBits, asyncOutDataBitCount);
  std::string asyncMask = portString(asyncOutMaskBits, asyncOutDataBitCount);
  std::string syncMask = portString(syncOutMaskBits, syncOutDataBitCount);

  reservePlanes(stepPlanes, syncOutDataBitCount);

  command.clearMasks();
  if (hasAsync) {
    command.setAsyncOutValues(std::move(asyncValues));
    command.setAsyncOutMask(std::move(asyncMask));
  }
  if (hasSync) {
    command.setSyncOutMask(std::move(syncMask));
    stagePulseTrains(syncOutStepBits, syncOutDataBitCount, stepPlanes, command);
  }
  command.writeOutputs(session, coreRef);
}

void QorVIO_Core::getPortBits(unsigned session, QOR_CORE_REF coreRef, unsigned char* asyncInValueBits,
                              unsigned char* asyncInActivityUpBits, unsigned char* asyncInActivityDownBits,
                              unsigned asyncInDataBitCount, unsigned char* syncInValueBits,
                              unsigned char* syncInActivityUpBits, unsigned char* syncInActivityDownBits,
                              unsigned char* syncInSyncActivityUpBits,
                              unsigned char* syncInSyncActivityDownBits, unsigned syncInDataBitCount) {
  command.readInputs(session, coreRef);
  if (asyncInDataBitCount != 0) {
    deliver(command.getAsyncInValues(), asyncInValueBits);
    deliver(command.getAsyncInActivityUp(), asyncInActivityUpBits);
    deliver(command.getAsyncInActivityDown(), asyncInActivityDownBits);
  }
  if (syncInDataBitCount != 0) {
    deliver(command.getSyncInValues(), syncInValueBits);
    deliver(command.getSyncInActivityUp(), syncInActivityUpBits);
    deliver(command.getSyncInActivityDown(), syncInActivityDownBits);
    deliver(command.getSyncInSyncActivityUp(), syncInSyncActivityUpBits);
    deliver(command.getSyncInSyncActivityDown(), syncInSyncActivityDownBits);
  }
}

}  // namespace QorRT
