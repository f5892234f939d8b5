// Ways from an address to a core: its status word, and the object that is set up for it.
#pragma once

#include <string>

#include "QorUtil.h"
#include "QorVIO_Core.h"
#include "src/api/CallFrame.h"

namespace QorRT {

inline constexpr unsigned vioCoreType = 9;

/// A buffer for a status word.
Qor_ByteBuffer statusBuffer();

/// The length of the buffer in bits.
unsigned bitLength(const Qor_ByteBuffer& buffer);

/// Reads the status word into the buffer and returns its head. When no VIO core is there, sends
/// `wrongTypeText` to the session and throws Qor_AbortException.
QOR_CORE_INFO readVioStatus(unsigned session, QOR_CORE_REF coreRef, Qor_ByteBuffer& statusWord,
                            const char* wrongTypeText);

/// The core that is set up at the address; the core list owns it. Throws logic_error when there is none.
QorVIO_Core& getVioCore(unsigned session, QOR_CORE_REF coreRef);

/// "Device:D,user chain number:U,core index:C" with blanks after the commas, as messages name an address.
std::string addressText(QOR_CORE_REF coreRef);

/// The frame of every exported function that works on a core: runs the body on the core that is set up at the
/// address, under the session's target lock.
template <class Body>
unsigned onCore(unsigned session, QOR_CORE_REF coreRef, const Body& body) {
  return callFrame(session, [&] {
    QorJtagTargetLock lock(session, lockTimeout);
    body(getVioCore(session, coreRef));
    return callSucceeded;
  });
}

}  // namespace QorRT
