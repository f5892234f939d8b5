// One recording: its polls in step with a period, and its file, whole whatever ends it.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "board/session/CoreSession.h"

namespace qor {

struct Limits {
  std::uint64_t samples = 0;           ///< 0: as many as the time allows
  std::chrono::nanoseconds time{0};    ///< 0: as long as the samples take
  std::chrono::nanoseconds period{0};  ///< between polls; 0: at the full rate
};

struct Recorded {
  std::uint64_t samples = 0;
  std::uint64_t missed = 0;  ///< polls that the period asked for and the link was too slow for
};

/// "N samples in PATH", and how many polls were missed if any were.
std::string summary(const Recorded& recorded, const std::string& path);

/// Told of every sample, with the time since the recording began.
using OnSample = std::function<void(const Recorded& recorded, std::chrono::nanoseconds now)>;

/// Samples the signals to a file, by the ending of its path, until a limit is reached or Ctrl-C comes. When the link
/// fails, closes what was recorded until then and throws Failure, "why; kept" and the summary.
Recorded recordTo(const std::string& path, CoreSession& core, const std::vector<Signal>& signals,
                  const Limits& limits, const OnSample& onSample = {});

}  // namespace qor
