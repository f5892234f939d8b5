// Inputs read again and again: what they are, what moved, and which of them look different than before.
#pragma once

#include <cstdint>
#include <utility>
#include <vector>

#include "board/record/Poller.h"

namespace qor::tool {

class InputWatch {
 public:
  /// The poller must outlive it.
  InputWatch(Poller& poller, std::vector<Signal> inputs);

  /// Reads all inputs, for the next frame. Throws Failure, with the frame before as it was.
  void poll();

  /// Forgets what moved since the start.
  void clear();

  const std::vector<Signal>& inputs() const { return now_.inputs(); }
  std::uint64_t frames() const { return frames_; }

  /// The frame of the input's core.
  const Sample& sample(const Signal& input) const { return (*frame_)[input.core]; }

  /// Its activity flags are those of all frames since the start or the last clear().
  const Sample& sinceStart(const Signal& input) const { return sinceStart_.pending()[input.core]; }

  /// Which inputs differ, in value or activity, from what they were at the call before: every one at first. An input
  /// may be named twice.
  std::vector<std::size_t> takeChanged() { return std::exchange(changed_, {}); }

 private:
  void markAll();

  Poller& poller_;
  Subscription now_;
  Subscription sinceStart_;
  const std::vector<Sample>* frame_;
  std::vector<std::size_t> changed_;
  bool isCleared_ = true;
  std::uint64_t frames_ = 0;
};

}  // namespace qor::tool
