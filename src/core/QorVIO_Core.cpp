#include "QorVIO_Core.h"

#include <memory>
#include <utility>

namespace QorRT {

namespace {

constexpr unsigned tableSizeHint = 100;

}  // namespace

QorVIO_Core::QorVIO_Core(unsigned session, QOR_CORE_REF coreRef, QOR_CORE_INFO coreInfo,
                         const unsigned char* statusWord, unsigned bitCount)
    : Qor_SignalCore(session, coreRef, coreInfo, statusWord, bitCount),
      vioCoreInfo{},
      inputSignals(tableSizeHint),
      outputSignals(tableSizeHint) {}

QorVIO_Core& QorVIO_Core::operator=(const QorVIO_Core& other) {
  if (this == &other) return *this;
  QorVIO_NameTable inputs = duplicate(other.inputSignals);
  QorVIO_NameTable outputs = duplicate(other.outputSignals);
  QorVIO_Command image = other.command;
  Qor_SignalCore::operator=(other);
  command.swap(image);
  vioCoreInfo = other.vioCoreInfo;
  inputSignals.swap(inputs);
  outputSignals.swap(outputs);
  return *this;
}

QorVIO_NameTable QorVIO_Core::duplicate(const QorVIO_NameTable& table) {
  QorVIO_NameTable copy(tableSizeHint);
  for (const auto& [key, group] : table) {
    std::vector<unsigned> positions = group->getPositionVector();
    auto twin = std::make_unique<QorVIO_SignalGroup>(&command, group->getPortType(), positions,
                                                     group->getName(), group->getKeyName());
    std::string_view twinKey = twin->getKeyName();
    copy.emplace(twinKey, std::move(twin));
  }
  return copy;
}

QorVIO_Core::~QorVIO_Core() {
  inputSignals.clear();
  outputSignals.clear();
}

bool QorVIO_Core::initFromStatusWord(unsigned session) {
  Qor_ByteBuffer& statusWord = getStatusWord();
  getVioCoreStatus(session, getCoreRef(), getCoreInfo(), statusWord, statusWord.getSize() * 8, &vioCoreInfo);
  setCorePhysicalSignalCounts();
  command.initFromCoreInfo(vioCoreInfo);
  addReservedSignals();
  return true;
}

void QorVIO_Core::setCorePhysicalSignalCounts() {
  setCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT, vioCoreInfo.async_input_count);
  setCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT, vioCoreInfo.sync_input_count);
  setCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_OUTPUT, vioCoreInfo.async_output_count);
  setCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT, vioCoreInfo.sync_output_count);
}

void QorVIO_Core::addSignal(Qor_SignalBase* /*signal*/) {}

Qor_SignalBase* QorVIO_Core::getSignal(const std::string& /*name*/, unsigned /*first*/, unsigned /*last*/) {
  return nullptr;
}

void QorVIO_Core::removeSignal(Qor_SignalBase* /*signal*/) {}

}  // namespace QorRT
