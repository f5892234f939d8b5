// libQorCore once more: one VIO core of four asynchronous bits each way, which knows one write and one answer.
#include "QorCore.h"

#include <algorithm>
#include <memory>
#include <stdexcept>

namespace QorRT {
namespace {

std::unique_ptr<Qor_Core> theCore;
bool written = false;

constexpr QOR_CORE_INFO head{0x51, 9, 10, 0, 0};
constexpr char writeOfA[] = "00 1 0 01 0 00000009 5F\n00 1 0 02 0 00000004 0";
constexpr unsigned char recordsOfA[] = {0x0C, 0x0C};  // bits 1 and 3 high and risen

}  // namespace

Qor_Core::Qor_Core(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo,
                   const unsigned char* statusWord, unsigned bitCount)
    : session_(session), coreRef_(coreRef), coreInfo_(coreInfo), statusWord_(bitCount / 8, 0, 0) {
  std::copy_n(statusWord, bitCount / 8, statusWord_.uPtr());
}
Qor_Core::~Qor_Core() = default;
Qor_Core& Qor_Core::operator=(const Qor_Core&) = default;
bool Qor_Core::isQorVbrnSlave() {
  return false;
}

Qor_SignalCore::Qor_SignalCore(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo,
                               const unsigned char* statusWord, unsigned bitCount)
    : Qor_Core(session, coreRef, coreInfo, statusWord, bitCount) {}
Qor_SignalCore::~Qor_SignalCore() = default;
Qor_SignalCore& Qor_SignalCore::operator=(const Qor_SignalCore&) = default;
unsigned Qor_SignalCore::getCorePhysicalSignalCount(unsigned type) const {
  return physicalSignalCounts_.at(type);
}
void Qor_SignalCore::setCorePhysicalSignalCount(unsigned type, unsigned count) {
  physicalSignalCounts_[type] = count;
}

Qor_SignalBase::Qor_SignalBase(unsigned type, const std::string& name) : type_(type), name_(name) {}
Qor_SignalBase::Qor_SignalBase(const Qor_SignalBase&) = default;
Qor_SignalBase::~Qor_SignalBase() = default;
Qor_SignalBase& Qor_SignalBase::operator=(const Qor_SignalBase&) = default;
std::string Qor_SignalBase::getProperty(const std::string& name) const {
  return properties_.at(name);
}
void Qor_SignalBase::setProperty(const char* name, const char* value) {
  properties_[name] = value;
}
void Qor_SignalBase::setProperty(std::string& name, std::string& value) {
  properties_[name] = value;
}

Qor_Signal::Qor_Signal(unsigned type, unsigned unit, unsigned position, const std::string& name)
    : Qor_SignalBase(type, name), unit_(unit), position_(position) {}
Qor_SignalGroup::Qor_SignalGroup(unsigned type, unsigned, std::vector<unsigned>& positions,
                                 const std::string& name)
    : Qor_SignalBase(type | SIGNAL_TYPE_GROUP, name), positions_(positions) {}
Qor_SignalGroup& Qor_SignalGroup::operator=(const Qor_SignalGroup&) = default;

Qor_Core* Qor_CoreList::getCore(unsigned, QOR_CORE_REF) {
  return theCore.get();
}
void Qor_CoreList::addCore(unsigned, Qor_Core* core) {
  theCore.reset(core);
}
void Qor_CoreList::removeCore(unsigned, Qor_Core** core) {
  theCore.reset();
  *core = nullptr;
}

void Qor_CoreComm::getCoreStatus(unsigned, QOR_CORE_REF, QOR_CORE_INFO* coreInfo, Qor_ByteBuffer& word,
                                 unsigned) {
  *coreInfo = head;
  word[60 / 8] |= 4 << 60 % 8;  // asynchronous inputs
  word[92 / 8] |= 4 << 92 % 8;  // asynchronous outputs
}

void Qor_CoreComm::commandSequence(unsigned, const std::string& text, unsigned char* result, unsigned,
                                   QOR_PROGRESS_CALLBACK) {
  if (result == nullptr && text != writeOfA) throw std::logic_error("an unknown write: " + text);
  if (result == nullptr)
    written = true;
  else if (written)
    std::copy(std::begin(recordsOfA), std::end(recordsOfA), result);
}

}  // namespace QorRT

unsigned QorCore_getCoreStatus(unsigned, QOR_CORE_REF, QOR_CORE_INFO* coreInfo, unsigned char*, unsigned) {
  *coreInfo = QorRT::head;
  return 0;
}
