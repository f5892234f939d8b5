#include "board/record/Recording.h"

#include <algorithm>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "board/record/Recorder.h"
#include "board/record/TriggerGate.h"

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

  Turn await(const StopFunction& stop) {
    const bool isPeriodic = limits_.period.count() != 0;
    const Clock::time_point due = isPeriodic ? begin_ + std::min(slotBegin(next_), timeLimit()) : begin_;
    const bool goesOn = sleepUntil(due, stop);
    const nanoseconds woken = std::min<nanoseconds>(Clock::now() - begin_, timeLimit());
    const std::uint64_t missed = isPeriodic ? missedBy(woken) : 0;
    next_ += missed + 1;
    return {woken, missed, !goesOn || woken == timeLimit()};
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

// False when the time is over, or the stop function says so.
bool runPolls(Poller& poller, Recorder& recorder, TriggerGate& gate, const Limits& limits,
              const StopFunction& stop, const OnSample& onSample, const Recorded& recorded) {
  Schedule schedule(limits);
  while (!gate.isDone()) {
    const auto [now, missed, isEnd] = schedule.await(stop);
    const auto nanosecond = static_cast<std::uint64_t>(now.count());
    if (isEnd && missed != 0) gate.addMissed(nanosecond, missed);
    if (isEnd) return false;
    poller.poll();
    recorder.write(nanosecond, missed);
    if (onSample) onSample(recorded, now);
  }
  return true;
}

// Keeps the samples in arrays.
class ArrayWriter : public SampleWriter {
 public:
  ArrayWriter(Samples& samples, std::size_t expected) : samples_(samples), expected_(expected) {}

  void begin(const Heading& heading) override {
    samples_.nanoseconds.reserve(expected_);
    samples_.missed.reserve(expected_);
    for (const Signal& each : heading.signals) {
      SampledInput& input = samples_.inputs.emplace_back(SampledInput{byteCount(each.width()), {}, {}});
      input.values.reserve(expected_ * input.bytesEach);
      input.moves.reserve(expected_);
    }
  }

  void add(const Poll& poll) override {
    samples_.nanoseconds.push_back(static_cast<std::int64_t>(poll.nanoseconds));
    samples_.missed.push_back(poll.missed);
    if (poll.isTrigger) samples_.trigger = samples_.missed.size() - 1;
    for (std::size_t i = 0; i < samples_.inputs.size(); ++i) {
      SampledInput& input = samples_.inputs[i];
      input.values.insert(input.values.end(), poll.values[i].begin(), poll.values[i].end());
      input.moves.push_back(poll.moved[i]);
    }
  }

  void addMissed(std::uint64_t, std::uint64_t) override {}
  void end() override {}

 private:
  Samples& samples_;
  std::size_t expected_;
};

}  // namespace

std::string summary(const Recorded& recorded, const std::string& path) {
  std::string text = std::to_string(recorded.samples) + " samples in " + path;
  if (recorded.missed != 0)
    text +=
        ", " + std::to_string(recorded.missed) + (recorded.missed == 1 ? " poll missed" : " polls missed");
  return text;
}

void record(SampleWriter& writer, Poller& poller, const std::vector<Signal>& inputs, const Limits& limits,
            Recorded& recorded, const StopFunction& stop, const OnSample& onSample) {
  TriggerGate gate(writer, poller, limits, recorded);
  Recorder recorder(poller, inputs, gate, limits.when ? limits.when->text() : "");
  bool isComplete = false;
  try {
    if (limits.when || limits.until) poller.poll();
    gate.forget();
    isComplete = runPolls(poller, recorder, gate, limits, stop, onSample, recorded);
  } catch (const FileFailure&) {
    throw;
  } catch (const Failure&) {  // what was recorded until then is worth keeping
    writer.end();
    throw;
  }
  writer.end();
  if (limits.when && !isComplete && !recorded.isTriggered && !(stop && stop()))
    throw Timeout("not within " + durationText(limits.time) + ": " + limits.when->text());
}

Recorded recordTo(const std::string& path, Poller& poller, const std::vector<Signal>& inputs,
                  const Limits& limits, const StopFunction& stop, const OnSample& onSample) {
  const std::unique_ptr<SampleWriter> writer = sampleWriter(path);
  Recorded recorded;
  try {
    record(*writer, poller, inputs, limits, recorded, stop, onSample);
  } catch (const FileFailure&) {
    throw;
  } catch (const Failure& failure) {
    throw Failure(std::string(failure.what()) + "; kept " + summary(recorded, path));
  }
  return recorded;
}

Samples recordToArrays(Poller& poller, const std::vector<Signal>& inputs, const Limits& limits,
                       const StopFunction& stop) {
  Samples samples;
  ArrayWriter writer(samples, limits.samples != 0 ? limits.samples : limits.before + limits.after);
  Recorded recorded;
  record(writer, poller, inputs, limits, recorded, stop);
  return samples;
}

}  // namespace qor
