#include "board/record/Player.h"

#include <algorithm>

#include "board/Board.h"

namespace qor {
namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::nanoseconds;

bool canBurst(const PlayScript& script) {
  return std::all_of(script.signals.begin(), script.signals.end(),
                     [](const Signal& each) { return each.port == Port::syncOut; });
}

// The rows from `first` on, as many as one exchange takes: with several, the last one stays.
std::vector<Assignment> rowsFrom(const PlayScript& script, std::size_t first, std::size_t count) {
  std::vector<Assignment> assignments;
  for (std::size_t column = 0; column < script.signals.size(); ++column) {
    Assignment each{script.signals[column], {}};
    for (std::size_t row = first; row < first + count; ++row) each.steps.push_back(script.rows[row][column]);
    if (count > 1) each.steps.resize(stepCount, Bytes(each.steps.back()));
    assignments.push_back(std::move(each));
  }
  return assignments;
}

}  // namespace

Played play(Board& board, const PlayScript& script, nanoseconds period, const StopFunction& stop) {
  if (script.hasTimes() && period.count() != 0)
    throw WrongUse("the rows of the script have times of their own");
  const bool isTimed = script.hasTimes() || period.count() != 0;
  const std::size_t atOnce = !isTimed && canBurst(script) ? stepCount : 1;
  const Clock::time_point begin = Clock::now();
  Played played;
  while (played.rows < script.rows.size()) {
    const nanoseconds time =
        script.hasTimes() ? script.times[played.rows] : static_cast<std::int64_t>(played.rows) * period;
    if (isTimed && played.rows != 0 && Clock::now() > begin + time) ++played.late;
    if (!sleepUntil(begin + time, stop)) break;
    const std::size_t count = std::min(atOnce, script.rows.size() - played.rows);
    board.give(rowsFrom(script, played.rows, count));
    played.rows += count;
    ++played.exchanges;
  }
  return played;
}

}  // namespace qor
