// The attempts of one call: how often it is repeated, and what is said when that did not help.
#pragma once

#include <chrono>
#include <string>
#include <vector>

#include "platform/core/Qor_CoreLink.h"

namespace QorRT {

/// Those that came back damaged.
class Qor_Damage {
 public:
  /// False when the call has failed.
  bool mayRepeat(const std::string& seen, bool isSilence);

  /// Nothing that begins as a hub does was seen at any attempt.
  bool isOnlySilence() const { return onlySilence_; }

  /// "SEEN, in 4 attempts", or "4 attempts: SEEN; OTHER; ..." where they differ.
  std::string text() const;

 private:
  std::vector<std::string> seen_;
  bool onlySilence_ = true;
};

/// Those that waited for the design clock: with more room, then with more time.
class Qor_Wait {
 public:
  /// Makes room or lets time pass. False when the design clock has had two seconds, or 300 ms for a host that is to stop.
  bool mayRepeat(Qor_WaitingRoom& room, bool isStopped);

  /// "COUNT attempts in TIME ms"
  std::string text() const;

 private:
  using Clock = std::chrono::steady_clock;

  Clock::time_point begin_;
  std::chrono::milliseconds pause_{1};
  unsigned count_ = 0;
};

}  // namespace QorRT
