#include "tools/qorvio/InputWatch.h"

#include <numeric>

namespace qor::tool {

InputWatch::InputWatch(Poller& poller, std::vector<Signal> inputs)
    : poller_(poller),
      now_(poller, std::move(inputs)),
      sinceStart_(poller, now_.inputs()),
      frame_(&now_.pending()) {
  markAll();
}

// Activity since the start grows only where a flag differs from the frame before, but for the first frame.
void InputWatch::poll() {
  poller_.poll();
  frame_ = &now_.look();
  ++frames_;
  if (std::exchange(isCleared_, false)) return markAll();
  const std::vector<std::size_t>& changed = now_.changed();
  changed_.insert(changed_.end(), changed.begin(), changed.end());
}

void InputWatch::clear() {
  sinceStart_.look();
  isCleared_ = true;
  markAll();
}

void InputWatch::markAll() {
  changed_.resize(inputs().size());
  std::iota(changed_.begin(), changed_.end(), std::size_t{0});
}

}  // namespace qor::tool
