// Checks whose texts the interface fixes.
#pragma once

#include <stdexcept>

namespace QorRT {

/// Throws logic_error with the text unless the condition is true.
inline void require(bool condition, const char* text) {
  if (!condition) throw std::logic_error(text);
}

}  // namespace QorRT
