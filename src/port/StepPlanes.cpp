#include "src/port/StepPlanes.h"

#include <algorithm>

#include "QorUtil.h"
#include "src/port/CharBlock.h"

namespace QorRT {

namespace {

constexpr unsigned side = 8;
constexpr unsigned pieceBits = 1024;

/// Steps `firstStep` to `firstStep` + 7 of eight bits from `firstBit` on, a bit in each row.
CharBlock stepsOfBits(const StepPlanes& planes, unsigned firstStep, std::size_t firstBit) {
  CharBlock rows;
  for (unsigned row = 0; row < side; ++row) rows[row] = loadRow(planes[firstStep + row].data() + firstBit);
  transpose(rows);
  return rows;
}

/// The pulse trains of eight bits from `offset` of the planes on, which are port bits `firstBit` and up.
void stageEight(const StepPlanes& planes, std::size_t offset, unsigned firstBit, QorVIO_Command& command) {
  const CharBlock early = stepsOfBits(planes, 0, offset);
  const CharBlock late = stepsOfBits(planes, side, offset);
  for (unsigned row = 0; row < side; ++row) {
    QorVIO_Command::PulseTrain train;
    storeRow(early[row], train.data());
    storeRow(late[row], train.data() + side);
    command.setSyncOutPulseTrain(firstBit + row, train);
  }
}

void stageOne(const StepPlanes& planes, std::size_t offset, unsigned bit, QorVIO_Command& command) {
  for (unsigned step = 0; step < planes.size(); ++step)
    command.setSyncOutPulseTrainBit(bit, step, planes[step][offset]);
}

}  // namespace

void reservePlanes(StepPlanes& planes, unsigned width) {
  for (std::string& plane : planes) plane.reserve(std::min(pieceBits, width));
}

void stagePulseTrains(const unsigned char* stepBits, unsigned width, StepPlanes& planes,
                      QorVIO_Command& command) {
  const std::size_t planeBytes = (std::size_t{width} + 7) / 8;
  for (unsigned first = 0; first < width; first += pieceBits) {
    const unsigned count = std::min(pieceBits, width - first);
    for (std::size_t step = 0; step < planes.size(); ++step)
      Qor_NumberUtil::bin2ReverseBinStr(stepBits + step * planeBytes + first / 8, count, planes[step]);
    unsigned offset = 0;
    for (; offset + side <= count; offset += side) stageEight(planes, offset, first + offset, command);
    for (; offset < count; ++offset) stageOne(planes, offset, first + offset, command);
  }
}

}  // namespace QorRT
