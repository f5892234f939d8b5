// Times and rates as people write them.
#pragma once

#include <chrono>
#include <string>

namespace qor {

/// "250us", "100ms", "10s", "2m" or "1h", fractions too. Throws WrongUse.
std::chrono::nanoseconds parseDuration(const std::string& text);

/// The time between two turns, at so many a second. Throws WrongUse when there are fewer or more than those.
std::chrono::nanoseconds periodOf(double rate, double fewest, double most);

}  // namespace qor
