#include <cxxabi.h>

#include <cstdio>

#include "QorJtag.h"
#include "platform/jtag/Qor_SessionTable.h"

namespace {

void printMessage(unsigned session, const char* text) {
  std::fprintf(stderr, "session %u: %s\n", session, text);
}

}  // namespace

unsigned QorJtag_session_sendMessage(unsigned session, unsigned type, const char* text) {
  if (text == nullptr) text = "";
  try {
    const auto receiver = QorRT::Qor_SessionTable::instance().find(session);
    const auto handler = receiver == nullptr ? nullptr : receiver->handler();
    if (handler == nullptr) {
      printMessage(session, text);
    } else {
      (*handler)(type, text);
    }
    return receiver == nullptr ? 1 : 0;
  } catch (const abi::__forced_unwind&) {  // the thread is being cancelled
    throw;
  } catch (...) {  // a sink that throws must not keep its caller from returning
    return 1;
  }
}
