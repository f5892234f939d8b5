// Inputs read again and again: what they are, what moved, and which of them look different than before.
#pragma once

#include <cstdint>
#include <utility>
#include <vector>

#include "board/session/CoreSession.h"

namespace qor {

class InputWatch {
 public:
  /// The core must outlive it.
  InputWatch(CoreSession& core, std::vector<Signal> inputs);

  /// Reads all inputs, for the next frame. Throws Failure, with the frame before as it was.
  void poll();

  /// Forgets what moved since the start.
  void clear();

  const std::vector<Signal>& inputs() const { return inputs_; }
  std::uint64_t frames() const { return frames_; }

  /// The frame.
  const Sample& sample() const { return sample_; }

  /// Its activity flags are those of all frames since the start or the last clear(); it has no values.
  const Sample& sinceStart() const { return sinceStart_; }

  /// Which inputs differ, in value or activity, from what they were at the call before: every one at first. An input
  /// may be named twice.
  std::vector<std::size_t> takeChanged() { return std::exchange(changed_, {}); }

 private:
  void markAll();
  void addActivity();
  void findChanged();

  CoreSession& core_;
  std::vector<Signal> inputs_;
  Sample next_;
  Sample sample_;
  Sample sinceStart_;
  Bytes asyncDiffers_, syncDiffers_;
  std::vector<std::size_t> changed_;
  bool isCleared_ = false;
  std::uint64_t frames_ = 0;
};

}  // namespace qor
