#include "Recorder.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace tool {

Recorder::Recorder(CoreSession& core, std::vector<Signal> signals, SampleWriter& writer)
    : core_(core),
      writer_(writer),
      signals_(std::move(signals)),
      next_(core.emptySample()),
      shown_(core.emptySample()),
      values_(signals_.size()),
      isMarked_(signals_.size()),
      moved_(signals_.size()) {
  bySignalBit_[0].resize(core.info().async_input_count);
  bySignalBit_[1].resize(core.info().sync_input_count);
  for (std::size_t i = 0; i < signals_.size(); ++i) {
    values_[i].resize((signals_[i].width() + 7) / 8);
    for (unsigned bit : signals_[i].bits)
      bySignalBit_[signals_[i].port == Port::asyncIn ? 0 : 1][bit].push_back(i);
  }
  marked_.reserve(signals_.size());
  changed_.reserve(signals_.size());
  writer_.begin(signals_, refText(core.ref()));
}

void Recorder::write(std::uint64_t nanoseconds, std::uint64_t missed) {
  findChanged();
  findMoved();
  writer_.add({nanoseconds, missed, values_, changed_, moved_});
  std::swap(shown_, next_);
  isFirst_ = false;
}

// Marks the signals with a bit that differs between the two images, or that is set in either.
void Recorder::mark(Port port, const Bytes& first, const Bytes& second, bool differing) {
  constexpr std::size_t word = sizeof(std::uint64_t);
  const SignalsOfBits& signals = signalsOf(port);
  for (std::size_t byte = 0; byte < first.size(); byte += word) {
    std::uint64_t a = 0, b = 0;
    const std::size_t count = std::min(word, first.size() - byte);
    std::memcpy(&a, &first[byte], count);
    std::memcpy(&b, &second[byte], count);
    if ((differing ? a ^ b : a | b) == 0) continue;
    const std::size_t last = std::min(signals.size(), 8 * (byte + count));
    for (std::size_t bit = 8 * byte; bit < last; ++bit) {
      const unsigned x = bitAt(first.data(), static_cast<unsigned>(bit)),
                     y = bitAt(second.data(), static_cast<unsigned>(bit));
      if ((differing ? x ^ y : x | y) == 0) continue;
      for (std::size_t signal : signals[bit]) {
        if (isMarked_[signal]) continue;
        isMarked_[signal] = true;
        marked_.push_back(signal);
      }
    }
  }
}

void Recorder::findChanged() {
  changed_.clear();
  marked_.clear();
  if (isFirst_) {
    for (std::size_t i = 0; i < signals_.size(); ++i) changed_.push_back(i);
  } else {
    mark(Port::asyncIn, next_.asyncIn, shown_.asyncIn, true);
    mark(Port::syncIn, next_.syncIn, shown_.syncIn, true);
    changed_.assign(marked_.begin(), marked_.end());
    std::sort(changed_.begin(), changed_.end());
  }
  for (std::size_t i : marked_) isMarked_[i] = false;
  for (std::size_t i : changed_) extract(signals_[i], next_.values(signals_[i].port), values_[i]);
}

void Recorder::findMoved() {
  marked_.clear();
  std::fill(moved_.begin(), moved_.end(), false);
  mark(Port::asyncIn, next_.asyncUp, next_.asyncDown, false);
  mark(Port::syncIn, next_.syncUp, next_.syncDown, false);
  for (std::size_t i : marked_) {
    moved_[i] = true;
    isMarked_[i] = false;
  }
}

}  // namespace tool
