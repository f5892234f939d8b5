// Times as people write them.
#pragma once

#include <chrono>
#include <string>

namespace tool {

/// "250us", "100ms", "10s", "2m" or "1h", fractions too. Throws WrongUse.
std::chrono::nanoseconds parseDuration(const std::string& text);

}  // namespace tool
