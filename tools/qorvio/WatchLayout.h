// What watch remembers of a board from day to day: which output was chosen, and whether the history was shown.
#pragma once

#include <string>

#include "tools/qorvio/LiveWatch.h"

namespace qor::tool {

class WatchLayout {
 public:
  explicit WatchLayout(std::string cable) : cable_(std::move(cable)) {}

  /// Where nothing is remembered, does nothing.
  void restore(LiveWatch& live) const;

  /// Where it cannot be written, does nothing.
  void keep(const LiveWatch& live) const;

 private:
  std::string cable_;
};

}  // namespace qor::tool
