#include "platform/core/Qor_Attempts.h"

#include <algorithm>
#include <thread>

namespace QorRT {
namespace {

using std::chrono::milliseconds;

constexpr std::size_t mostRepeats = 3;
constexpr milliseconds longestWait(2000), stoppedWait(300), longestPause(64);

}  // namespace

bool Qor_Damage::mayRepeat(const std::string& seen, bool isSilence) {
  onlySilence_ = onlySilence_ && isSilence;
  seen_.push_back(seen);
  return seen_.size() <= mostRepeats;
}

std::string Qor_Damage::text() const {
  const std::string attempts = std::to_string(seen_.size()) + " attempts";
  if (std::equal(seen_.begin() + 1, seen_.end(), seen_.begin())) return seen_.front() + ", in " + attempts;
  std::string text = attempts;
  for (const std::string& seen : seen_) text += (&seen == &seen_.front() ? ": " : "; ") + seen;
  return text;
}

bool Qor_Wait::mayRepeat(Qor_WaitingRoom& room, bool isStopped) {
  if (count_++ == 0) begin_ = Clock::now();
  if (room.grow()) return true;
  if (Clock::now() - begin_ > (isStopped ? stoppedWait : longestWait)) return false;
  std::this_thread::sleep_for(pause_);
  pause_ = std::min(pause_ * 2, longestPause);
  return true;
}

std::string Qor_Wait::text() const {
  const auto passed = std::chrono::duration_cast<milliseconds>(Clock::now() - begin_);
  return std::to_string(count_) + " attempts in " + std::to_string(passed.count()) + " ms";
}

}  // namespace QorRT
