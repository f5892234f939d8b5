#include "src/api/CoreAccess.h"

#include <stdexcept>

#include "src/api/CallFrame.h"
#include "src/api/Qor_AbortException.h"

namespace QorRT {

Qor_ByteBuffer statusBuffer() {
  return Qor_ByteBuffer(154, 10, 10);
}

unsigned bitLength(const Qor_ByteBuffer& buffer) {
  return buffer.getSize() * 8;
}

QOR_CORE_INFO readVioStatus(unsigned session, QOR_CORE_REF coreRef, Qor_ByteBuffer& statusWord,
                            const char* wrongTypeText) {
  QOR_CORE_INFO info{};
  Qor_CoreComm::getCoreStatus(session, coreRef, &info, statusWord, bitLength(statusWord));
  if (info.core_type != vioCoreType) {
    sendMessage(session, errorMessage, wrongTypeText);
    throw Qor_AbortException();
  }
  return info;
}

QorVIO_Core& getVioCore(unsigned session, QOR_CORE_REF coreRef) {
  Qor_Core* core = Qor_CoreList::getCore(session, coreRef);
  if (core != nullptr && core->getCoreType() == vioCoreType)
    if (auto* vioCore = dynamic_cast<QorVIO_Core*>(core)) return *vioCore;
  throw std::logic_error("Data structures not initialized for VIO core " + addressText(coreRef) + ".");
}

std::string addressText(QOR_CORE_REF coreRef) {
  return "Device:" + std::to_string(coreRef.device_index) +
         ", user chain number:" + std::to_string(coreRef.user_chain_number) +
         ", core index:" + std::to_string(coreRef.core_index);
}

}  // namespace QorRT
