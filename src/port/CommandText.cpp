// The wire format: lines of seven fields that the core-support library runs on the target.
#include <algorithm>
#include <cstddef>

#include "QorUtil.h"
#include "QorVIO_Command.h"

namespace QorRT {

namespace {

constexpr unsigned outputsCode = 1;
constexpr unsigned obeyCode = 2;
constexpr unsigned readCode = 3;

/// Room beside the data for the rest of its line and the line that follows it.
constexpr std::size_t otherLinesLength = 64;

void appendField(std::string& text, unsigned value, unsigned bitWidth) {
  std::string field;
  text += Qor_NumberUtil::uInt2HexStr(value, bitWidth, field);
  text += ' ';
}

bool isSame(const QOR_CORE_REF& left, const QOR_CORE_REF& right) {
  return left.device_index == right.device_index && left.user_chain_number == right.user_chain_number &&
         left.core_index == right.core_index;
}

}  // namespace

// A command is nearly always that of one core, and these fields are half of a short text.
const std::string& QorVIO_Command::addressText(const QOR_CORE_REF& coreRef) {
  std::string& text = scratch.address;
  if (!text.empty() && isSame(coreRef, scratch.addressOf)) return text;
  std::string made;
  appendField(made, coreRef.device_index, 8);
  appendField(made, coreRef.user_chain_number, 4);
  appendField(made, coreRef.core_index, 4);
  text.swap(made);
  scratch.addressOf = coreRef;
  return text;
}

const std::string& QorVIO_Command::outputData() {
  std::string& data = scratch.outputDigits;
  data.resize(2 * asyncOutValues.size() + (stepCount + 1) * syncOutPulseTrains.size());
  auto end = std::copy(asyncOutValues.begin(), asyncOutValues.end(), data.begin());
  for (const PulseTrain& train : syncOutPulseTrains) end = std::copy(train.begin(), train.end(), end);
  end = std::copy(asyncOutMask.begin(), asyncOutMask.end(), end);
  std::copy(syncOutMask.begin(), syncOutMask.end(), end);
  return data;
}

std::string& QorVIO_Command::buildCommandText(const QOR_CORE_REF& coreRef, unsigned commandCode,
                                              std::string& text, unsigned* resultBitCount) {
  unsigned resultBits = 0;
  text.clear();
  if (commandCode == outputsCode) {
    const std::string& data = outputData();
    const std::string& hex = Qor_NumberUtil::binStr2HexStr(data, scratch.outputHex);
    text.reserve(hex.size() + otherLinesLength);
    text += addressText(coreRef);
    text += "01 0 ";
    appendField(text, static_cast<unsigned>(data.size() + 1), 32);
    text += hex;
  } else if (commandCode == obeyCode) {
    text += addressText(coreRef);
    text += "02 0 00000004 0";
  } else if (commandCode == readCode) {
    unsigned bitCount = recordDigitCount() + 16;
    text += addressText(coreRef);
    text += "03 1 ";
    appendField(text, bitCount, 32);
    text += "0\n";
    text += addressText(coreRef);
    text += "04 1 00000004 0";
    resultBits = (bitCount + 7) / 8 * 8 + 8;
  }
  if (resultBitCount != nullptr) *resultBitCount = resultBits;
  return text;
}

}  // namespace QorRT
