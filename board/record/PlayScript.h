/// @file
/// A CSV table of output values, as play drives it: names, and below them rows of values.
#pragma once

#include <chrono>
#include <string>
#include <vector>

#include "board/Export.h"
#include "board/model/Bits.h"
#include "board/model/SignalTable.h"

namespace qor {

struct PlayScript {
  std::vector<Signal> signals;           ///< one a column of values
  std::vector<std::vector<Bytes>> rows;  ///< one value a signal
  std::vector<std::chrono::nanoseconds>
      times;  ///< one per row, from the start on, never falling; or none at all

  bool hasTimes() const { return !times.empty(); }
};

/// Reads a script from its text; `path` is for messages. Its first column may be time_s, in seconds; then what record
/// writes beside the values, and units after names, are skipped. A byte order mark, blanks around fields and empty lines are skipped.
/// Throws WrongUse, "FILE:LINE: what is wrong".
QORBOARD_API PlayScript parsePlayScript(std::string_view text, const std::string& path,
                                        const SignalTable& signals);

/// The same of a file, which must be a regular one of 256 MiB at most.
QORBOARD_API PlayScript readPlayScript(const std::string& path, const SignalTable& signals);

}  // namespace qor
