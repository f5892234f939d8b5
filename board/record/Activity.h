// Activity flags as arrows.
#pragma once

#include <string>

#include "board/session/CoreSession.h"

namespace qor {

/// Whether any of the signal's bits is set in an image of its port.
bool anyOf(const Signal& signal, const Bytes& portImage);

/// Whether any bit of the signal rose or fell since the read before.
struct Activity {
  bool up = false, down = false;
  bool syncUp = false, syncDown = false;  ///< as the design's clock saw it; synchronous inputs only
};

Activity activityOf(const Signal& signal, const Sample& sample);

/// "↑" rising, "↓" falling, "↕" both, "·" none.
const char* arrow(bool up, bool down);

}  // namespace qor
