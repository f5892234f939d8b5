/// @file
/// Playing a script of output values on a board.
#pragma once

#include <chrono>
#include <cstddef>

#include "board/Export.h"
#include "board/record/PlayScript.h"
#include "board/session/Stop.h"

namespace qor {

class Board;

struct Played {
  std::size_t rows = 0;
  std::size_t exchanges = 0;
  std::size_t late = 0;  ///< rows that were due before the row above them was done
};

/// Gives the outputs row after row: at the script's own times, else one per period, else as fast as the cable goes; then
/// synchronous outputs alone play 16 rows per exchange, a row per clock of the design. `stop` ends it between two rows.
/// Throws WrongUse for a script with times and a period that is not 0, and Failure.
QORBOARD_API Played play(Board& board, const PlayScript& script, std::chrono::nanoseconds period = {},
                         const StopFunction& stop = {});

}  // namespace qor
