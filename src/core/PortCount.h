// The check of a bit count against the width of its port.
#pragma once

#include "QorCore.h"
#include "src/Require.h"

namespace QorRT {

/// Throws logic_error with the text unless the count is the width of the core's port of this signal type, or 0.
inline void requireCount(const Qor_SignalCore& core, unsigned type, unsigned count, const char* text) {
  require(count == core.getCorePhysicalSignalCount(type) || count == 0, text);
}

}  // namespace QorRT
