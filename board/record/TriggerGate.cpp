#include "board/record/TriggerGate.h"

#include <numeric>

#include "board/model/Errors.h"

namespace qor {
namespace {

std::vector<std::size_t> allOf(std::size_t count) {
  std::vector<std::size_t> numbers(count);
  std::iota(numbers.begin(), numbers.end(), std::size_t{0});
  return numbers;
}

template <class Row>
std::vector<std::size_t> differing(const Row& a, const Row& b) {
  std::vector<std::size_t> numbers;
  for (std::size_t i = 0; i < a.size(); ++i)
    if (a[i] != b[i]) numbers.push_back(i);
  return numbers;
}

}  // namespace

TriggerGate::TriggerGate(SampleWriter& writer, Poller& poller, const Limits& limits, Recorded& recorded)
    : writer_(writer), limits_(limits), recorded_(recorded) {
  if (!limits.when && (limits.before != 0 || limits.after != 0))
    throw WrongUse("samples before and after a trigger need its condition");
  if (limits.when) when_.emplace(poller, *limits.when);
  if (limits.until) until_.emplace(poller, *limits.until);
  recorded.isTriggered = !limits.when;
}

void TriggerGate::forget() {
  if (when_) when_->subscription.look();
  if (until_) until_->subscription.look();
}

void TriggerGate::add(const Poll& poll) {
  const bool isEvent = when_ && when_->isTrue(), isOver = until_ && until_->isTrue();
  if (recorded_.isTriggered) {
    ++after_;
    pass(poll);
    return judge(isOver);
  }
  if (!isEvent) return hold(poll);
  recorded_.isTriggered = true;
  hold(poll);  // as the last one
  release();
  judge(false);  // the end is looked for from the next sample on
}

void TriggerGate::hold(const Poll& poll) {
  if (held_.size() <= limits_.before) {
    held_.push_back({poll.nanoseconds, poll.missed, poll.values, poll.moved});
    next_ = held_.size() % (limits_.before + 1);
    return;
  }
  Held& oldest = held_[next_];  // whose memory is used again
  oldest.nanoseconds = poll.nanoseconds;
  oldest.missed = poll.missed;
  oldest.values = poll.values;
  oldest.moved = poll.moved;
  next_ = (next_ + 1) % held_.size();
}

// The samples that were held back, the oldest first; the last of them is the trigger.
void TriggerGate::release() {
  const std::size_t count = held_.size(), first = count <= limits_.before ? 0 : next_;
  const Held* before = nullptr;
  begin_ = held_[first].nanoseconds;
  for (std::size_t i = 0; i < count; ++i) {
    const Held& each = held_[(first + i) % count];
    const auto changed =
        before != nullptr ? differing(each.values, before->values) : allOf(each.values.size());
    const auto moved = before != nullptr ? differing(each.moved, before->moved) : allOf(each.moved.size());
    pass({each.nanoseconds, before != nullptr ? each.missed : 0, each.values, changed, each.moved, moved,
          i + 1 == count});
    before = &each;
  }
  held_ = {};
}

void TriggerGate::pass(const Poll& poll) {
  Poll moved = poll;
  moved.nanoseconds -= begin_;
  writer_.add(moved);
  ++recorded_.samples;
  recorded_.missed += poll.missed;
}

void TriggerGate::judge(bool isOver) {
  isDone_ = isOver || (limits_.samples != 0 && recorded_.samples >= limits_.samples) ||
            (limits_.when && limits_.after != 0 && after_ >= limits_.after);
}

void TriggerGate::addMissed(std::uint64_t nanoseconds, std::uint64_t missed) {
  if (!recorded_.isTriggered) return;
  writer_.addMissed(nanoseconds - begin_, missed);
  recorded_.missed += missed;
}

}  // namespace qor
