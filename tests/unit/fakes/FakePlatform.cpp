#include "tests/unit/fakes/FakePlatform.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <utility>

#include "QorJtag.h"

namespace fake {

namespace {

Platform current;

std::string hex(unsigned value) {
  char text[16];
  std::snprintf(text, sizeof text, "%x", value);
  return text;
}

}  // namespace

Platform& platform() {
  return current;
}

void reset() {
  current = Platform();
}

std::string addressOf(QOR_CORE_REF ref) {
  return std::to_string(ref.device_index) + '.' + std::to_string(ref.user_chain_number) + '.' +
         std::to_string(ref.core_index);
}

void Platform::note(const std::string& name, const std::string& rest) {
  calls.push_back(name + ' ' + rest);
  if (auto action = before.find(name); action != before.end()) action->second();
}

std::vector<std::string> Platform::take() {
  return std::exchange(calls, {});
}

void Platform::putField(unsigned offset, unsigned length, unsigned value) {
  word.resize(std::max<std::size_t>(word.size(), (offset + length + 7) / 8));
  for (unsigned i = 0; i < length; ++i) {
    auto bit = static_cast<unsigned char>(1U << ((offset + i) % 8));
    unsigned char& byte = word[(offset + i) / 8];
    byte = static_cast<unsigned char>((value >> i) & 1 ? byte | bit : byte & ~bit);
  }
}

void Platform::answerAsVioCore(unsigned asyncIn, unsigned syncIn, unsigned asyncOut, unsigned syncOut) {
  info = {0x51, 9, 10, 0, 0};
  putField(60, 16, asyncIn);
  putField(76, 16, syncIn);
  putField(92, 16, asyncOut);
  putField(108, 16, syncOut);
}

}  // namespace fake

using fake::addressOf;
using fake::platform;

unsigned QorJtag_session_sendMessage(unsigned, unsigned type, const char* text) {
  platform().note("message", fake::hex(type) + ' ' + text);
  return 0;
}

unsigned QorJtag_target_flush(unsigned session) {
  platform().note("flush", std::to_string(session));
  return 0;
}

unsigned QorCore_getCoreStatus(unsigned, QOR_CORE_REF coreRef, QOR_CORE_INFO* coreInfo,
                               unsigned char* statusWord, unsigned bitCount) {
  platform().note("plain status", addressOf(coreRef) + ' ' + (statusWord == nullptr ? "null" : "buffer") +
                                      ' ' + std::to_string(bitCount));
  *coreInfo = platform().info;
  return platform().plainStatus;
}

namespace QorRT {

class Qor_Session {
 public:
  unsigned handle;
};

QorJtagTargetLock::QorJtagTargetLock(unsigned session, unsigned timeout) {
  platform().note("lock", std::to_string(session) + ' ' + std::to_string(timeout));
  session_ = std::make_shared<Qor_Session>(Qor_Session{session});
}

QorJtagTargetLock::~QorJtagTargetLock() {
  platform().note("unlock", std::to_string(session_->handle));
}

Qor_Core* Qor_CoreList::getCore(unsigned, QOR_CORE_REF coreRef) {
  auto core = platform().cores.find(addressOf(coreRef));
  return core == platform().cores.end() ? nullptr : core->second.get();
}

void Qor_CoreList::addCore(unsigned, Qor_Core* core) {
  platform().note("add", addressOf(core->getCoreRef()));
  platform().cores[addressOf(core->getCoreRef())].reset(core);
}

void Qor_CoreList::removeCore(unsigned, Qor_Core** core) {
  platform().note("remove", addressOf((*core)->getCoreRef()));
  platform().cores.erase(addressOf((*core)->getCoreRef()));
  *core = nullptr;
}

void Qor_CoreComm::getCoreStatus(unsigned, QOR_CORE_REF coreRef, QOR_CORE_INFO* coreInfo,
                                 Qor_ByteBuffer& statusWord, unsigned bitCount) {
  platform().note("status", addressOf(coreRef) + ' ' + std::to_string(bitCount));
  *coreInfo = platform().info;
  std::copy(platform().word.begin(), platform().word.end(), statusWord.uPtr());
}

void Qor_CoreComm::commandSequence(unsigned, const std::string& text, unsigned char* result,
                                   unsigned resultBitCount, QOR_PROGRESS_CALLBACK) {
  std::string size = resultBitCount == 0 ? "" : " -> " + std::to_string(resultBitCount);
  platform().note("sequence", text + size);
  const std::string& digits = platform().readDigits;
  if (result == nullptr) return;
  // The bits above the records are nobody's business: ones show whether somebody looks.
  std::memset(result, 0xFF, resultBitCount / 8);
  for (std::size_t k = 0; k < digits.size(); ++k) {
    std::size_t bit = digits.size() - 1 - k;
    if (digits[k] == '0') result[bit / 8] = static_cast<unsigned char>(result[bit / 8] & ~(1U << (bit % 8)));
  }
}

}  // namespace QorRT
