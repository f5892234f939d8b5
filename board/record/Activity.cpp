#include "board/record/Activity.h"

namespace qor {

bool anyOf(const Signal& signal, const Bytes& portImage) {
  for (unsigned bit : signal.bits)
    if (bitAt(portImage.data(), bit) != 0) return true;
  return false;
}

Activity activityOf(const Signal& signal, const Sample& sample) {
  Activity activity;
  activity.up = anyOf(signal, sample.up(signal.port));
  activity.down = anyOf(signal, sample.down(signal.port));
  if (signal.port == Port::syncIn) {
    activity.syncUp = anyOf(signal, sample.syncSyncUp);
    activity.syncDown = anyOf(signal, sample.syncSyncDown);
  }
  return activity;
}

const char* arrow(bool up, bool down) {
  return up ? (down ? "↕" : "↑") : (down ? "↓" : "·");
}

}  // namespace qor
