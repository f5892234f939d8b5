#include "src/api/CallFrame.h"

#include <cstring>

#include "src/api/Qor_AbortException.h"

namespace QorRT {

void sendMessage(unsigned session, unsigned type, const char* text) {
  try {
    QorJtag_session_sendMessage(session, type, text);
  } catch (const abi::__forced_unwind&) {
    throw;
  } catch (...) {  // nobody is left to report to
  }
}

unsigned reportException(unsigned session, const std::exception& exception) {
  bool isAbort = std::strcmp(exception.what(), abortText) == 0;
  sendMessage(session, isAbort ? abortMessage : errorMessage, exception.what());
  return callFailed;
}

}  // namespace QorRT
