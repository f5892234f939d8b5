// Threads that another thread cancels.
#pragma once

namespace os {

/// While it lives, a cancellation of this thread waits. What must not be left half-way, and destructors, which cannot be
/// left at all, need that.
class CancelLater {
 public:
  CancelLater() noexcept;
  CancelLater(const CancelLater&) = delete;
  CancelLater& operator=(const CancelLater&) = delete;
  ~CancelLater();

 private:
  int before_ = 0;
};

/// Ends this thread if it was cancelled meanwhile: by an exception that is none of the standard ones and must go on.
void endIfCancelled();

}  // namespace os
