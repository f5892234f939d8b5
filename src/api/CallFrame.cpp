#include "src/api/CallFrame.h"

#include <cstring>

#include "src/api/Qor_AbortException.h"

namespace QorRT {

void sendMessage(unsigned session, unsigned type, const char* text) noexcept {
  try {
    QorJtag_session_sendMessage(session, type, text);
  } catch (...) {  // there is nobody left to tell
  }
}

unsigned reportException(unsigned session, const std::exception& exception) noexcept {
  bool isAbort = std::strcmp(exception.what(), abortText) == 0;
  sendMessage(session, isAbort ? abortMessage : errorMessage, exception.what());
  return callFailed;
}

}  // namespace QorRT
