#include "bench/NullPlatform.h"

#include <algorithm>
#include <cstdio>
#include <memory>

#include "QorCore.h"
#include "QorJtag.h"

unsigned bench::portWidth = 0;
std::size_t bench::exchanges = 0;

namespace {

std::unique_ptr<QorRT::Qor_Core> theCore;

}  // namespace

unsigned QorJtag_session_sendMessage(unsigned, unsigned, const char* text) {
  std::fprintf(stderr, "%s\n", text);
  return 0;
}

unsigned QorJtag_target_flush(unsigned) {
  return 0;
}

unsigned QorCore_getCoreStatus(unsigned, QOR_CORE_REF, QOR_CORE_INFO*, unsigned char*, unsigned) {
  return 0;
}

namespace QorRT {

class Qor_Session {};

QorJtagTargetLock::QorJtagTargetLock(unsigned, unsigned) {}
QorJtagTargetLock::~QorJtagTargetLock() = default;

Qor_Core* Qor_CoreList::getCore(unsigned, QOR_CORE_REF) {
  return theCore.get();
}
void Qor_CoreList::addCore(unsigned, Qor_Core* core) {
  theCore.reset(core);
}
void Qor_CoreList::removeCore(unsigned, Qor_Core**) {
  theCore.reset();
}

void Qor_CoreComm::getCoreStatus(unsigned, QOR_CORE_REF, QOR_CORE_INFO* info, Qor_ByteBuffer& word,
                                 unsigned) {
  *info = {0, 9, 10, 0, 0};
  // The four widths are 16 bits apart, from bit 60 on: in the middle of a byte.
  for (unsigned byte : {7U, 9U, 11U, 13U}) {
    word[byte] = static_cast<unsigned char>(word[byte] | bench::portWidth << 4);
    word[byte + 1] = static_cast<unsigned char>(bench::portWidth >> 4);
    word[byte + 2] = static_cast<unsigned char>(bench::portWidth >> 12);
  }
}

void Qor_CoreComm::commandSequence(unsigned, const std::string&, unsigned char* result, unsigned bitCount,
                                   QOR_PROGRESS_CALLBACK) {
  ++bench::exchanges;
  if (result != nullptr) std::fill_n(result, bitCount / 8, static_cast<unsigned char>(0x5A));
}

}  // namespace QorRT
