#include "board/record/Recorder.h"

namespace qor {
namespace {

unsigned char codeOf(const Activity& activity) {
  return static_cast<unsigned char>((activity.up ? 1 : 0) + (activity.down ? 2 : 0) +
                                    (activity.syncUp ? 4 : 0) + (activity.syncDown ? 8 : 0));
}

}  // namespace

Recorder::Recorder(Poller& poller, std::vector<Signal> signals, SampleWriter& writer, const std::string& when)
    : subscription_(poller, std::move(signals)),
      writer_(writer),
      values_(subscription_.inputs().size()),
      moved_(values_.size()) {
  changed_.reserve(values_.size());
  movedOtherwise_.reserve(values_.size());
  writer_.begin({subscription_.inputs(), poller.cores(), when});
}

void Recorder::write(std::uint64_t nanoseconds, std::uint64_t missed) {
  const std::vector<Signal>& signals = subscription_.inputs();
  const std::vector<Sample>& samples = subscription_.look();
  changed_ = subscription_.changedValues();
  for (std::size_t i : changed_)
    extract(signals[i], samples[signals[i].core].values(signals[i].port), values_[i]);
  movedOtherwise_.clear();
  for (std::size_t i : subscription_.changedMoves()) {
    const unsigned char moved = codeOf(activityOf(signals[i], samples[signals[i].core]));
    if (moved != moved_[i]) movedOtherwise_.push_back(i);
    moved_[i] = moved;
  }
  writer_.add({nanoseconds, missed, values_, changed_, moved_, movedOtherwise_});
}

}  // namespace qor
