#include "QorVIO_Command.h"

#include <algorithm>
#include <initializer_list>
#include <utility>

#include "QorCore.h"
#include "QorJtag.h"
#include "QorUtil.h"
#include "src/port/InputRecords.h"

namespace QorRT {

namespace {

constexpr QorVIO_Command::PulseTrain lowThroughout = {'0', '0', '0', '0', '0', '0', '0', '0',
                                                      '0', '0', '0', '0', '0', '0', '0', '0'};

/// Digit k of every record becomes '1' where port string k, counted from 1, has a '1'.
template <std::size_t recordDigits>
void addOnes(std::initializer_list<const std::string*> ports, char* digits) {
  for (const std::string* port : ports) {
    ++digits;
    for (std::size_t i = 0; i < port->size(); ++i)
      if ((*port)[i] == '1') digits[recordDigits * i] = '1';
  }
}

}  // namespace

QorVIO_Command::QorVIO_Command() : vioCoreInfo{} {}

QorVIO_Command::QorVIO_Command(const QorVIO_Command& other) = default;

QorVIO_Command& QorVIO_Command::operator=(const QorVIO_Command& other) {
  QorVIO_Command copy(other);
  swap(copy);
  return *this;
}

QorVIO_Command::~QorVIO_Command() = default;

void QorVIO_Command::swap(QorVIO_Command& other) noexcept {
  asyncOutValues.swap(other.asyncOutValues);
  syncOutPulseTrains.swap(other.syncOutPulseTrains);
  asyncOutMask.swap(other.asyncOutMask);
  syncOutMask.swap(other.syncOutMask);
  asyncInValues.swap(other.asyncInValues);
  asyncInActivityUp.swap(other.asyncInActivityUp);
  asyncInActivityDown.swap(other.asyncInActivityDown);
  syncInValues.swap(other.syncInValues);
  syncInActivityUp.swap(other.syncInActivityUp);
  syncInActivityDown.swap(other.syncInActivityDown);
  syncInSyncActivityUp.swap(other.syncInSyncActivityUp);
  syncInSyncActivityDown.swap(other.syncInSyncActivityDown);
  std::swap(vioCoreInfo, other.vioCoreInfo);
  std::swap(keepsActivity, other.keepsActivity);
}

void QorVIO_Command::initFromCoreInfo(QORVIO_CORE_INFO info) {
  vioCoreInfo = info;
  for (std::string* port : {&asyncOutValues, &asyncOutMask}) port->assign(info.async_output_count, '0');
  syncOutPulseTrains.assign(info.sync_output_count, lowThroughout);
  syncOutMask.assign(info.sync_output_count, '0');
  for (std::string* port : {&asyncInValues, &asyncInActivityUp, &asyncInActivityDown})
    port->assign(info.async_input_count, '0');
  for (std::string* port : {&syncInValues, &syncInActivityUp, &syncInActivityDown, &syncInSyncActivityUp,
                            &syncInSyncActivityDown})
    port->assign(info.sync_input_count, '0');
}

void QorVIO_Command::clearMasks() {
  asyncOutMask.assign(asyncOutMask.size(), '0');
  syncOutMask.assign(syncOutMask.size(), '0');
}

void QorVIO_Command::writeOutputs(unsigned session, const QOR_CORE_REF& coreRef) {
  if (asyncOutValues.empty() && syncOutPulseTrains.empty()) return;
  std::string& text = buildCommandText(coreRef, 1, scratch.text, nullptr);
  text += '\n';
  text += buildCommandText(coreRef, 2, scratch.obeyText, nullptr);
  Qor_CoreComm::commandSequence(session, text, nullptr, 0, nullptr);
  QorJtag_target_flush(session);
}

void QorVIO_Command::readInputs(unsigned session, const QOR_CORE_REF& coreRef) {
  if (asyncInValues.empty() && syncInValues.empty()) return;
  unsigned resultBitCount = 0;
  const std::string& text = buildCommandText(coreRef, 3, scratch.text, &resultBitCount);
  // All room first: once the core has given its activity flags away, nothing may fail here any more.
  const unsigned resultBytes = resultBitCount / 8;
  Qor_ByteBuffer& result = scratch.result;
  if (result.getSize() != resultBytes) {
    scratch.inputDigits.resize(recordDigitCount());
    scratch.resultHex = Qor_ByteBuffer(2 * resultBytes + 1, 0, 0);
    result = Qor_ByteBuffer(resultBytes, 0, 0);
  }
  std::fill_n(result.uPtr(), resultBytes, static_cast<unsigned char>(0));
  Qor_CoreComm::commandSequence(session, text, result.uPtr(), resultBitCount, nullptr);

  result.bin2HexString(0, scratch.resultHex);
  Qor_NumberUtil::hexStr2BinStr(scratch.resultHex.ptr(), recordDigitCount(), scratch.inputDigits);
  char* const digits = scratch.inputDigits.data();
  if (keepsActivity) {
    addOnes<asyncRecordDigits>({&asyncInActivityUp, &asyncInActivityDown}, digits);
    addOnes<syncRecordDigits>(
        {&syncInActivityUp, &syncInActivityDown, &syncInSyncActivityUp, &syncInSyncActivityDown},
        digits + asyncRecordDigits * asyncInValues.size());
  }
  keepsActivity = false;
  decodeRecords(digits);
}

unsigned QorVIO_Command::recordDigitCount() const {
  return static_cast<unsigned>(asyncRecordDigits * asyncInValues.size() +
                               syncRecordDigits * syncInValues.size());
}

void QorVIO_Command::decodeRecords(const char* digits) {
  splitAsyncRecords(digits, asyncInValues.size(),
                    {asyncInValues.data(), asyncInActivityUp.data(), asyncInActivityDown.data()});
  splitSyncRecords(digits + asyncRecordDigits * asyncInValues.size(), syncInValues.size(),
                   {syncInValues.data(), syncInActivityUp.data(), syncInActivityDown.data(),
                    syncInSyncActivityUp.data(), syncInSyncActivityDown.data()});
}

}  // namespace QorRT
