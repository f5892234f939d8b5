// libQorJtag once more: one session, 7, whose messages go to stderr.
#include "QorJtag.h"

#include <cstdio>

#include "Board.h"

unsigned openBoard() {
  return 7;
}

unsigned QorJtag_session_sendMessage(unsigned, unsigned, const char* text) {
  std::fprintf(stderr, "%s\n", text);
  return 0;
}

unsigned QorJtag_target_flush(unsigned) {
  return 0;
}

namespace QorRT {

class Qor_Session {};

QorJtagTargetLock::QorJtagTargetLock(unsigned, unsigned) {}
QorJtagTargetLock::~QorJtagTargetLock() = default;

}  // namespace QorRT
