#include "board/record/Recorder.h"

#include <algorithm>
#include <numeric>
#include <utility>

namespace qor {
namespace {

bool hasBit(const Signal& signal, const Bytes& portImage) {
  return std::any_of(signal.bits.begin(), signal.bits.end(),
                     [&](unsigned bit) { return bitAt(portImage.data(), bit) != 0; });
}

}  // namespace

Recorder::Recorder(CoreSession& core, const std::vector<Signal>& signals, SampleWriter& writer)
    : core_(core),
      writer_(writer),
      signals_(signals),
      next_(core.emptySample()),
      shown_(core.emptySample()),
      values_(signals.size()),
      moved_(signals.size()),
      isMarked_(signals.size()) {
  index(signals);
  marked_.reserve(signals.size());
  movedOtherwise_.reserve(signals.size());
  changed_.resize(signals.size());
  std::iota(changed_.begin(), changed_.end(), 0U);
  writer_.begin(signals_, refText(core.ref()));
}

void Recorder::index(const std::vector<Signal>& signals) {
  for (Port port : {Port::asyncIn, Port::syncIn}) {
    const Bytes room = next_.values(port);
    InputPort input{port, {}, room, room};
    input.signals.resize(8 * room.size());
    for (std::size_t i = 0; i < signals.size(); ++i)
      for (unsigned bit : signals[i].bits)
        if (signals[i].port == port) input.signals[bit].push_back(i);
    inputs_.push_back(std::move(input));
  }
}

void Recorder::write(std::uint64_t nanoseconds, std::uint64_t missed) {
  findChanged();
  findMoved();
  writer_.add({nanoseconds, missed, values_, changed_, moved_, movedOtherwise_});
  std::swap(shown_, next_);
  isFirst_ = false;
}

// Marks the signals with a bit that differs between the two images.
void Recorder::mark(const InputPort& input, const Bytes& now, const Bytes& before) {
  for (std::size_t byte = 0; byte < now.size(); ++byte) {
    std::size_t bit = 8 * byte;
    for (unsigned differing = now[byte] ^ before[byte]; differing != 0; differing >>= 1, ++bit) {
      if ((differing & 1) == 0) continue;
      for (std::size_t signal : input.signals[bit]) {
        if (isMarked_[signal] != 0) continue;
        isMarked_[signal] = 1;
        marked_.push_back(signal);
      }
    }
  }
}

void Recorder::clearMarks() {
  for (std::size_t i : marked_) isMarked_[i] = 0;
  marked_.clear();
}

// All of them at the first poll.
void Recorder::findChanged() {
  if (!isFirst_) {
    for (const InputPort& each : inputs_) mark(each, next_.values(each.port), shown_.values(each.port));
    changed_.assign(marked_.begin(), marked_.end());
    clearMarks();
  }
  for (std::size_t i : changed_) extract(signals_[i], next_.values(signals_[i].port), values_[i]);
}

// A bit that moved otherwise than before need not be the only one of its signal.
void Recorder::findMoved() {
  for (InputPort& each : inputs_) {
    const Bytes &up = next_.up(each.port), &down = next_.down(each.port);
    std::swap(each.moved, each.movedBefore);
    std::transform(up.begin(), up.end(), down.begin(), each.moved.begin(),
                   [](unsigned char a, unsigned char b) { return static_cast<unsigned char>(a | b); });
    mark(each, each.moved, each.movedBefore);
  }
  movedOtherwise_.clear();
  for (std::size_t i : marked_) {
    const InputPort& input = inputs_[signals_[i].port == Port::asyncIn ? 0 : 1];
    const unsigned char moved = hasBit(signals_[i], input.moved) ? 1 : 0;
    if (moved != moved_[i]) movedOtherwise_.push_back(i);
    moved_[i] = moved;
  }
  clearMarks();
}

}  // namespace qor
