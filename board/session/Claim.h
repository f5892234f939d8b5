/// @file
/// Who reads a core: a read takes the core's activity with it, so that two programs would take it from each other.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "board/Export.h"

namespace qor {

/// Held by one host at a time, of all that use the same folder, and released when it ends, however it ends.
class QORBOARD_API Claim {
 public:
  /// Waits half a second for a host that is about to end. `key` names board and core, `what` the core for messages.
  /// Throws Busy, with program, process and time of who has it. A folder that cannot be written makes no claim.
  Claim(const std::string& folder, const std::string& key, const std::string& what);
  Claim(const Claim&) = delete;
  Claim& operator=(const Claim&) = delete;
  ~Claim();

 private:
  struct Lock;
  std::unique_ptr<Lock> lock_;
};

}  // namespace qor
