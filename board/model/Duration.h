/// @file
/// Times and rates as people write them.
#pragma once

#include <chrono>
#include <string>

#include "board/Export.h"

namespace qor {

/// "250us", "100ms", "10s", "2m" or "1h", fractions too. Throws WrongUse.
QORBOARD_API std::chrono::nanoseconds parseDuration(const std::string& text);

/// "250 us", "100 ms" or "10 s".
QORBOARD_API std::string durationText(std::chrono::nanoseconds time);

/// The time between two turns, at so many a second. Throws WrongUse when there are fewer or more than those.
QORBOARD_API std::chrono::nanoseconds periodOf(double rate, double fewest, double most);

}  // namespace qor
