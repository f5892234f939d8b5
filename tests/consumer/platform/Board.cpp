// The recording fakes of the unit tests as a platform library: four asynchronous bits each way, one write, one answer.
#include "tests/unit/fakes/FakePlatform.h"

QOR_API unsigned openBoard() {
  fake::Platform& platform = fake::platform();
  platform.answerAsVioCore(4, 0, 4, 0);
  platform.before["sequence"] = [&platform] {
    if (platform.calls.back() == "sequence 00 1 0 01 0 00000009 5F\n00 1 0 02 0 00000004 0")
      platform.readDigits = "0000100000001000";
  };
  return 7;
}
