#include "Recording.h"

#include <algorithm>

#include "Errors.h"
#include "Recorder.h"
#include "Stop.h"

namespace tool {
namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::nanoseconds;

// When a poll is due, and what it finds when its time has come.
class Schedule {
 public:
  explicit Schedule(const Limits& limits) : limits_(limits) {}

  struct Turn {
    nanoseconds now;       ///< since the beginning
    std::uint64_t missed;  ///< polls that were due since the one before, and are over
  };

  Turn await(const Stop& stop) {
    if (limits_.period.count() == 0) return {now(), 0};
    const nanoseconds due = static_cast<std::int64_t>(next_) * limits_.period;
    stop.sleepUntil(begin_ + (limits_.time.count() != 0 ? std::min(due, limits_.time) : due));
    const nanoseconds woken = now();
    const auto slot = static_cast<std::uint64_t>(woken / limits_.period);
    const std::uint64_t missed = slot > next_ ? slot - next_ : 0;
    next_ += missed + 1;
    return {woken, missed};
  }

 private:
  nanoseconds now() const { return Clock::now() - begin_; }

  const Limits& limits_;
  const Clock::time_point begin_ = Clock::now();
  std::uint64_t next_ = 0;
};

void runPolls(Recorder& recorder, const Limits& limits, const OnSample& onSample, Recorded& recorded) {
  const Stop stop;
  Schedule schedule(limits);
  while (limits.samples == 0 || recorded.samples < limits.samples) {
    const auto [now, missed] = schedule.await(stop);
    if (stop.asked() || (limits.time.count() != 0 && now >= limits.time)) return;
    recorder.read();
    recorder.write(static_cast<std::uint64_t>(now.count()), missed);
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
    runPolls(recorder, limits, onSample, recorded);
  } catch (const Failure& failure) {  // what was recorded until then is worth keeping
    writer->end();
    throw Failure(std::string(failure.what()) + "; kept " + summary(recorded, path));
  }
  writer->end();
  return recorded;
}

}  // namespace tool
