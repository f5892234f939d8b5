#include "board/record/InputWatch.h"

#include <algorithm>
#include <initializer_list>
#include <numeric>

#include "board/record/Activity.h"

namespace qor {
namespace {

using Image = Bytes Sample::*;

constexpr std::initializer_list<Image> asyncImages = {&Sample::asyncIn, &Sample::asyncUp, &Sample::asyncDown};
constexpr std::initializer_list<Image> syncImages = {&Sample::syncIn, &Sample::syncUp, &Sample::syncDown,
                                                     &Sample::syncSyncUp, &Sample::syncSyncDown};
constexpr std::initializer_list<Image> flags = {&Sample::asyncUp,    &Sample::asyncDown,
                                                &Sample::syncUp,     &Sample::syncDown,
                                                &Sample::syncSyncUp, &Sample::syncSyncDown};

// The port bits in which any of the images differs.
void compare(const Sample& a, const Sample& b, std::initializer_list<Image> images, Bytes& differs) {
  std::fill(differs.begin(), differs.end(), static_cast<unsigned char>(0));
  for (Image image : images)
    for (std::size_t i = 0; i < differs.size(); ++i)
      differs[i] = static_cast<unsigned char>(differs[i] | ((a.*image)[i] ^ (b.*image)[i]));
}

}  // namespace

InputWatch::InputWatch(CoreSession& core, std::vector<Signal> inputs)
    : core_(core),
      inputs_(std::move(inputs)),
      next_(core.emptySample()),
      sample_(next_),
      asyncDiffers_(next_.asyncIn),
      syncDiffers_(next_.syncIn) {
  clear();
}

void InputWatch::poll() {
  core_.read(next_);
  std::swap(sample_, next_);
  ++frames_;
  addActivity();
  findChanged();
}

void InputWatch::clear() {
  sinceStart_ = core_.emptySample();
  isCleared_ = true;
  markAll();
}

void InputWatch::markAll() {
  changed_.resize(inputs_.size());
  std::iota(changed_.begin(), changed_.end(), std::size_t{0});
}

void InputWatch::addActivity() {
  for (Image image : flags)
    for (std::size_t i = 0; i < (sample_.*image).size(); ++i)
      (sinceStart_.*image)[i] = static_cast<unsigned char>((sinceStart_.*image)[i] | (sample_.*image)[i]);
}

// Activity since the start needs no look of its own: but for the first frame, it grows only where a flag differs from
// the frame before.
void InputWatch::findChanged() {
  if (std::exchange(isCleared_, false)) return markAll();
  compare(sample_, next_, asyncImages, asyncDiffers_);
  compare(sample_, next_, syncImages, syncDiffers_);
  for (std::size_t i = 0; i < inputs_.size(); ++i)
    if (anyOf(inputs_[i], inputs_[i].port == Port::asyncIn ? asyncDiffers_ : syncDiffers_))
      changed_.push_back(i);
}

}  // namespace qor
