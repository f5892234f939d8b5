#include "Activity.h"

namespace tool {
namespace {

bool any(const Signal& signal, const Bytes& flags) {
  for (unsigned bit : signal.bits)
    if (bitAt(flags.data(), bit) != 0) return true;
  return false;
}

}  // namespace

Activity activityOf(const Signal& signal, const Sample& sample) {
  Activity activity;
  activity.up = any(signal, sample.up(signal.port));
  activity.down = any(signal, sample.down(signal.port));
  if (signal.port == Port::syncIn) {
    activity.syncUp = any(signal, sample.syncSyncUp);
    activity.syncDown = any(signal, sample.syncSyncDown);
  }
  return activity;
}

const char* arrow(bool up, bool down) {
  return up ? (down ? "↕" : "↑") : (down ? "↓" : "·");
}

}  // namespace tool
