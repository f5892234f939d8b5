// The mutex of a session's target lock.
#pragma once

#include <chrono>
#include <condition_variable>
#include <mutex>

namespace QorRT {

/// A timed mutex that waits by the steady clock, and whose waits ThreadSanitizer can follow: it is blind to
/// those of std::timed_mutex. Not recursive.
class Qor_TargetMutex {
 public:
  /// False, not holding it, when `timeout` passes first.
  bool tryLockFor(std::chrono::milliseconds timeout);

  void lock();
  void unlock();

 private:
  std::mutex mutex_;
  std::condition_variable freed_;
  bool held_ = false;
};

}  // namespace QorRT
