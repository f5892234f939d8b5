// Holds samples back until a condition is true, then passes the ones before it, too, and says when there are enough.
#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "board/record/Poller.h"
#include "board/record/Recording.h"
#include "board/record/SampleWriter.h"

namespace qor {

class TriggerGate : public SampleWriter {
 public:
  /// All of them must outlive the gate. Throws WrongUse for limits that need a trigger and have none.
  TriggerGate(SampleWriter& writer, Poller& poller, const Limits& limits, Recorded& recorded);

  /// What moved until now makes no condition true.
  void forget();

  /// Whether the recording has all that the limits ask for.
  bool isDone() const { return isDone_; }

  void begin(const Heading& heading) override { writer_.begin(heading); }
  void add(const Poll& poll) override;
  void addMissed(std::uint64_t nanoseconds, std::uint64_t missed) override;
  void end() override { writer_.end(); }

 private:
  struct Held {
    std::uint64_t nanoseconds, missed;
    std::vector<Bytes> values;
    std::vector<unsigned char> moved;
  };
  struct Watched {
    Watched(Poller& poller, const Condition& its) : condition(its), subscription(poller, its.signals()) {}
    bool isTrue() { return condition.isTrue(subscription.look()); }

    const Condition& condition;
    Subscription subscription;
  };

  void hold(const Poll& poll);
  void release();
  void pass(const Poll& poll);
  void judge(bool isOver);

  SampleWriter& writer_;
  const Limits& limits_;
  Recorded& recorded_;
  std::optional<Watched> when_, until_;
  std::vector<Held> held_;  // a ring; the oldest at next_ when it is full
  std::size_t next_ = 0;
  std::uint64_t begin_ = 0;  // of the first sample that is passed
  std::uint64_t after_ = 0;  // samples passed since the trigger
  bool isDone_ = false;
};

}  // namespace qor
