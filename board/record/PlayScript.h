// A CSV table of output values, as play drives it: names, and below them rows of values.
#pragma once

#include <chrono>
#include <string>
#include <vector>

#include "board/model/SignalTable.h"
#include "board/model/Value.h"

namespace qor {

struct PlayScript {
  std::vector<Signal> signals;           ///< one a column of values
  std::vector<std::vector<Bytes>> rows;  ///< one value a signal
  std::vector<std::chrono::nanoseconds>
      times;  ///< one a row, from the start on, never falling; or none at all

  bool hasTimes() const { return !times.empty(); }
};

/// Its first column may be time_s, in seconds, and the one behind that missed, which is passed over: so record writes
/// them. Throws WrongUse, "FILE:LINE: what is wrong".
PlayScript readPlayScript(const std::string& path, const SignalTable& signals);

}  // namespace qor
