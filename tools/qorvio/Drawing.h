// A recording as a picture.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "board/record/VcdReader.h"

namespace qor::tool {

struct DrawingOptions {
  std::vector<std::string>
      names;  ///< what to draw, from top to bottom; empty for everything but _moved and missed_polls
  std::uint64_t begin;  ///< in steps of the dump, before the end
  std::uint64_t end;
};

/// SVG, as wide as a page. Bits are waves, wider signals lanes of hexadecimal values; what is unknown, and the time of
/// missed polls, is hatched. Throws WrongUse for a name that is not in the dump.
std::string drawing(const VcdDump& dump, const DrawingOptions& options);

}  // namespace qor::tool
