/// @file
/// How a caller interrupts what takes long.
#pragma once

#include <chrono>
#include <functional>

#include "board/Export.h"

namespace qor {

/// Asked again and again during a wait, at least ten times a second; true ends the wait. An empty one never does.
using StopFunction = std::function<bool()>;

/// Sleeps until then; false when the stop function ended it before.
QORBOARD_API bool sleepUntil(std::chrono::steady_clock::time_point due, const StopFunction& stop);

}  // namespace qor
