#include "port/StepPlanes.h"

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "QorUtil.h"

namespace QorRT {

namespace {

constexpr unsigned side = 8;
constexpr unsigned pieceBits = 1024;

#if defined(__BYTE_ORDER__)
static_assert(__BYTE_ORDER__ == __ORDER_LITTLE_ENDIAN__, "character 0 is the low byte of a loaded word");
#endif

/// Eight rows of eight characters, a row in each word.
using Block = std::array<std::uint64_t, side>;

/// Exchanges, in each pair of rows that lie `distance` apart, the character groups off the diagonal.
template <unsigned distance, std::uint64_t highGroups>
void exchange(Block& rows) {
  for (unsigned row = 0; row < side; ++row) {
    if ((row & distance) != 0) continue;
    std::uint64_t& upper = rows[row];
    std::uint64_t& lower = rows[row + distance];
    std::uint64_t difference = (upper ^ (lower << (8 * distance))) & highGroups;
    upper ^= difference;
    lower ^= difference >> (8 * distance);
  }
}

/// Character c of row r becomes character r of row c; characters count from the low end of a word.
void transpose(Block& rows) {
  exchange<4, 0xFFFFFFFF00000000>(rows);
  exchange<2, 0xFFFF0000FFFF0000>(rows);
  exchange<1, 0xFF00FF00FF00FF00>(rows);
}

/// Steps `firstStep` to `firstStep` + 7 of eight bits from `firstBit` on, a bit in each row.
Block stepsOfBits(const StepPlanes& planes, unsigned firstStep, std::size_t firstBit) {
  Block rows;
  for (unsigned row = 0; row < side; ++row)
    std::memcpy(&rows[row], planes[firstStep + row].data() + firstBit, side);
  transpose(rows);
  return rows;
}

/// The pulse trains of eight bits from `offset` of the planes on, which are port bits `firstBit` and up.
void stageEight(const StepPlanes& planes, std::size_t offset, unsigned firstBit, QorVIO_Command& command) {
  const Block early = stepsOfBits(planes, 0, offset);
  const Block late = stepsOfBits(planes, side, offset);
  for (unsigned row = 0; row < side; ++row) {
    QorVIO_Command::PulseTrain train;
    std::memcpy(train.data(), &early[row], side);
    std::memcpy(train.data() + side, &late[row], side);
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
