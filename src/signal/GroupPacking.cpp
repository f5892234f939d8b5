// Values of a group into the port image, and out of it.
#include <algorithm>
#include <array>
#include <cstddef>
#include <stdexcept>

#include "QorVIO_Command.h"
#include "QorVIO_SignalGroup.h"
#include "src/Messages.h"

namespace QorRT {

namespace {

constexpr unsigned stepCount = QorVIO_Command::stepCount;

char bitDigit(const unsigned char* value, unsigned bit) {
  return static_cast<char>('0' + ((value[bit / 8] >> (bit % 8)) & 1));
}

void orBit(unsigned char* buffer, unsigned bit, char digit) {
  if (buffer != nullptr && digit == '1')
    buffer[bit / 8] = static_cast<unsigned char>(buffer[bit / 8] | (1U << (bit % 8)));
}

}  // namespace

void QorVIO_SignalGroup::setValues(const unsigned char* value, unsigned size, unsigned count) {
  if (value == nullptr) throw std::logic_error("Null value for signal: " + getName());
  bool isSynchronous = getPortType() == SIGNAL_TYPE_VIO_SYNC_OUTPUT;
  bool isSequence = isSynchronous && count >= 2;
  requireBytes(size, static_cast<unsigned long long>(byteCount()) * (isSequence ? count : 1));
  if (isSequence)
    stageSequence(value, count);
  else if (isSynchronous)
    stageHeld(value);
  else
    stageAsync(value);
}

void QorVIO_SignalGroup::getValues(unsigned char* value, unsigned char* activityUp,
                                   unsigned char* activityDown, unsigned char* syncActivityUp,
                                   unsigned char* syncActivityDown, unsigned size) const {
  requireBytes(size, byteCount());
  const bool isSynchronous = getPortType() == SIGNAL_TYPE_VIO_SYNC_INPUT;
  char bits[5] = {};
  unsigned i = 0;
  for (unsigned position : getPositionVector()) {
    if (isSynchronous) {
      command->getSyncInBits(position, &bits[0], &bits[1], &bits[2], &bits[3], &bits[4]);
      orBit(syncActivityUp, i, bits[3]);
      orBit(syncActivityDown, i, bits[4]);
    } else {
      command->getAsyncInBits(position, &bits[0], &bits[1], &bits[2]);
    }
    orBit(value, i, bits[0]);
    orBit(activityUp, i, bits[1]);
    orBit(activityDown, i, bits[2]);
    ++i;
  }
}

void QorVIO_SignalGroup::requireBytes(unsigned size, unsigned long long needed) const {
  if (size < needed) throw tooSmall(getName());
}

void QorVIO_SignalGroup::stageSequence(const unsigned char* value, unsigned count) {
  std::array<const unsigned char*, stepCount> stepValues{};
  for (unsigned step = 0; step < stepCount; ++step)
    stepValues[step] = value + std::size_t{byteCount()} * std::min(step, count - 1);
  unsigned i = 0;
  for (unsigned position : getPositionVector()) {
    for (unsigned step = 0; step < stepCount; ++step)
      command->setSyncOutPulseTrainBit(position, step, bitDigit(stepValues[step], i));
    command->setSyncOutMaskBit(position, '1');
    ++i;
  }
}

void QorVIO_SignalGroup::stageHeld(const unsigned char* value) {
  unsigned i = 0;
  for (unsigned position : getPositionVector()) {
    QorVIO_Command::PulseTrain train;
    train.fill(bitDigit(value, i));
    command->setSyncOutPulseTrain(position, train);
    command->setSyncOutMaskBit(position, '1');
    ++i;
  }
}

void QorVIO_SignalGroup::stageAsync(const unsigned char* value) {
  unsigned i = 0;
  for (unsigned position : getPositionVector()) {
    command->setAsyncOutValueBit(position, bitDigit(value, i));
    command->setAsyncOutMaskBit(position, '1');
    ++i;
  }
}

}  // namespace QorRT
