#include "board/record/Recording.h"

#include <algorithm>

#include "board/model/Errors.h"
#include "board/record/Recorder.h"

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

void runPolls(Poller& poller, Recorder& recorder, SampleWriter& writer, const Limits& limits,
              const StopFunction& stop, const OnSample& onSample, Recorded& recorded) {
  Schedule schedule(limits);
  while (limits.samples == 0 || recorded.samples < limits.samples) {
    const auto [now, missed, isEnd] = schedule.await(stop);
    const auto nanosecond = static_cast<std::uint64_t>(now.count());
    if (isEnd) {
      if (missed != 0) writer.addMissed(nanosecond, missed);
      recorded.missed += missed;
      return;
    }
    poller.poll();
    recorder.write(nanosecond, missed);
    ++recorded.samples;
    recorded.missed += missed;
    if (onSample) onSample(recorded, now);
  }
}

// Keeps the samples in arrays.
class ArrayWriter : public SampleWriter {
 public:
  ArrayWriter(Samples& samples, std::size_t expected) : samples_(samples), expected_(expected) {}

  void begin(const std::vector<Signal>& inputs, const std::vector<QOR_CORE_REF>&) override {
    inputs_ = inputs;
    samples_.nanoseconds.reserve(expected_);
    samples_.missed.reserve(expected_);
    for (const Signal& each : inputs) {
      SampledInput& input = samples_.inputs.emplace_back(SampledInput{byteCount(each.width()), {}, {}});
      input.values.reserve(expected_ * input.bytesEach);
      input.moves.reserve(expected_);
    }
  }

  void add(const Poll& poll) override {
    samples_.nanoseconds.push_back(static_cast<std::int64_t>(poll.nanoseconds));
    samples_.missed.push_back(poll.missed);
    for (std::size_t i = 0; i < inputs_.size(); ++i) {
      SampledInput& input = samples_.inputs[i];
      input.values.insert(input.values.end(), poll.values[i].begin(), poll.values[i].end());
      input.moves.push_back(
          poll.moved[i] != 0 ? movesOf(activityOf(inputs_[i], poll.samples[inputs_[i].core])) : 0);
    }
  }

  void addMissed(std::uint64_t, std::uint64_t) override {}
  void end() override {}

 private:
  static unsigned char movesOf(const Activity& activity) {
    return static_cast<unsigned char>((activity.up ? 1 : 0) + (activity.down ? 2 : 0) +
                                      (activity.syncUp ? 4 : 0) + (activity.syncDown ? 8 : 0));
  }

  Samples& samples_;
  std::size_t expected_;
  std::vector<Signal> inputs_;
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
  Recorder recorder(poller, inputs, writer);
  try {
    runPolls(poller, recorder, writer, limits, stop, onSample, recorded);
  } catch (const FileFailure&) {
    throw;
  } catch (const Failure&) {  // what was recorded until then is worth keeping
    writer.end();
    throw;
  }
  writer.end();
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
  ArrayWriter writer(samples, limits.samples);
  Recorded recorded;
  record(writer, poller, inputs, limits, recorded, stop);
  return samples;
}

}  // namespace qor
