// Activity as an arrow.
#pragma once

namespace qor::tool {

/// "↑" rising, "↓" falling, "↕" both, "·" none.
constexpr const char* arrow(bool up, bool down) {
  return up ? (down ? "↕" : "↑") : (down ? "↓" : "·");
}

}  // namespace qor::tool
