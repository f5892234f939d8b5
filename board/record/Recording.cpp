#include "board/record/Recording.h"

#include <algorithm>

#include "board/model/Errors.h"
#include "board/record/Recorder.h"
#include "os/Stop.h"

namespace qor {
namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::nanoseconds;

// When a poll is due, and what it finds when its time has come.
class Schedule {
 public:
  explicit Schedule(const Limits& limits) : limits_(limits) {}

  struct Turn {
    nanoseconds now;       ///< since the beginning; at most the time limit
    std::uint64_t missed;  ///< polls that were due since the one before, and are over
    bool isEnd;            ///< nothing is to be polled any more
  };

  Turn await(const os::Stop& stop) {
    const bool isPeriodic = limits_.period.count() != 0;
    if (isPeriodic) stop.sleepUntil(begin_ + std::min(slotBegin(next_), timeLimit()));
    const nanoseconds woken = std::min<nanoseconds>(Clock::now() - begin_, timeLimit());
    const std::uint64_t missed = isPeriodic ? missedBy(woken) : 0;
    next_ += missed + 1;
    return {woken, missed, stop.asked() || woken == timeLimit()};
  }

 private:
  nanoseconds timeLimit() const { return limits_.time.count() != 0 ? limits_.time : nanoseconds::max(); }
  nanoseconds slotBegin(std::uint64_t slot) const { return static_cast<std::int64_t>(slot) * limits_.period; }

  // Every slot that began before the time limit, once that is reached; otherwise the one that runs is still to be used.
  std::uint64_t missedBy(nanoseconds woken) const {
    auto slot = static_cast<std::uint64_t>(woken / limits_.period);
    if (woken == timeLimit() && slotBegin(slot) < woken) ++slot;
    return slot > next_ ? slot - next_ : 0;
  }

  const Limits& limits_;
  const Clock::time_point begin_ = Clock::now();
  std::uint64_t next_ = 0;
};

void runPolls(Recorder& recorder, SampleWriter& writer, const Limits& limits, const OnSample& onSample,
              Recorded& recorded) {
  const os::Stop stop;
  Schedule schedule(limits);
  while (limits.samples == 0 || recorded.samples < limits.samples) {
    const auto [now, missed, isEnd] = schedule.await(stop);
    const auto nanosecond = static_cast<std::uint64_t>(now.count());
    if (isEnd) {
      if (missed != 0) writer.addMissed(nanosecond, missed);
      recorded.missed += missed;
      return;
    }
    recorder.read();
    recorder.write(nanosecond, missed);
    ++recorded.samples;
    recorded.missed += missed;
    if (onSample) onSample(recorded, now);
  }
}

}  // namespace

std::string summary(const Recorded& recorded, const std::string& path) {
  std::string text = std::to_string(recorded.samples) + " samples in " + path;
  if (recorded.missed != 0)
    text +=
        ", " + std::to_string(recorded.missed) + (recorded.missed == 1 ? " poll missed" : " polls missed");
  return text;
}

Recorded recordTo(const std::string& path, CoreSession& core, const std::vector<Signal>& signals,
                  const Limits& limits, const OnSample& onSample) {
  const std::unique_ptr<SampleWriter> writer = sampleWriter(path);
  Recorder recorder(core, signals, *writer);
  Recorded recorded;
  try {
    runPolls(recorder, *writer, limits, onSample, recorded);
  } catch (const Failure& failure) {  // what was recorded until then is worth keeping
    writer->end();
    throw Failure(std::string(failure.what()) + "; kept " + summary(recorded, path));
  }
  writer->end();
  return recorded;
}

}  // namespace qor
