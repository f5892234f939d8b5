#include <algorithm>
#include <utility>

#include "QorCore.h"

namespace QorRT {
namespace {

Qor_ByteBuffer copyOf(const unsigned char* bytes, unsigned bitCount) {
  Qor_ByteBuffer copy(bitCount / 8 + (bitCount % 8 != 0 ? 1 : 0), 0, 0);
  std::copy_n(bytes, copy.getSize(), copy.uPtr());
  return copy;
}

}  // namespace

Qor_NoHub::Qor_NoHub(const std::string& text) : std::runtime_error(text) {}
Qor_NoHub::Qor_NoHub(const Qor_NoHub&) = default;
Qor_NoHub::~Qor_NoHub() = default;

Qor_Core::Qor_Core(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo,
                   const unsigned char* statusWord, unsigned bitCount)
    : session_(session), coreRef_(coreRef), coreInfo_(coreInfo), statusWord_(copyOf(statusWord, bitCount)) {}

Qor_Core::~Qor_Core() = default;

Qor_Core& Qor_Core::operator=(const Qor_Core& other) {
  Qor_ByteBuffer statusWord(other.statusWord_);
  statusWord_ = std::move(statusWord);
  session_ = other.session_;
  coreRef_ = other.coreRef_;
  coreInfo_ = other.coreInfo_;
  return *this;
}

bool Qor_Core::isQorVbrnSlave() {
  return false;
}

Qor_SignalCore::Qor_SignalCore(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo,
                               const unsigned char* statusWord, unsigned bitCount)
    : Qor_Core(session, coreRef, coreInfo, statusWord, bitCount) {}

Qor_SignalCore::~Qor_SignalCore() = default;

Qor_SignalCore& Qor_SignalCore::operator=(const Qor_SignalCore& other) {
  std::map<unsigned, unsigned> counts(other.physicalSignalCounts_);
  Qor_Core::operator=(other);
  physicalSignalCounts_.swap(counts);
  return *this;
}

unsigned Qor_SignalCore::getCorePhysicalSignalCount(unsigned type) const {
  const auto entry = physicalSignalCounts_.find(type);
  return entry == physicalSignalCounts_.end() ? 0 : entry->second;
}

void Qor_SignalCore::setCorePhysicalSignalCount(unsigned type, unsigned count) {
  physicalSignalCounts_[type] = count;
}

}  // namespace QorRT
