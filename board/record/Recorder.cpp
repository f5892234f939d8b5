#include "board/record/Recorder.h"

namespace qor {

Recorder::Recorder(Poller& poller, std::vector<Signal> signals, SampleWriter& writer)
    : subscription_(poller, std::move(signals)),
      writer_(writer),
      values_(subscription_.inputs().size()),
      moved_(values_.size()) {
  changed_.reserve(values_.size());
  movedOtherwise_.reserve(values_.size());
  writer_.begin(subscription_.inputs(), poller.cores());
}

void Recorder::write(std::uint64_t nanoseconds, std::uint64_t missed) {
  const std::vector<Signal>& signals = subscription_.inputs();
  const std::vector<Sample>& samples = subscription_.look();
  changed_ = subscription_.changedValues();
  for (std::size_t i : changed_)
    extract(signals[i], samples[signals[i].core].values(signals[i].port), values_[i]);
  movedOtherwise_.clear();
  for (std::size_t i : subscription_.changedMoves()) {
    const Sample& sample = samples[signals[i].core];
    const bool moved =
        anyOf(signals[i], sample.up(signals[i].port)) || anyOf(signals[i], sample.down(signals[i].port));
    if (moved != (moved_[i] != 0)) movedOtherwise_.push_back(i);
    moved_[i] = moved ? 1 : 0;
  }
  writer_.add({nanoseconds, missed, values_, changed_, moved_, movedOtherwise_, samples});
}

}  // namespace qor
