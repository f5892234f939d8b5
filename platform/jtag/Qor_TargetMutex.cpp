#include "platform/jtag/Qor_TargetMutex.h"

namespace QorRT {

bool Qor_TargetMutex::tryLockFor(std::chrono::milliseconds timeout) {
  std::unique_lock<std::mutex> lock(mutex_);
  if (!freed_.wait_for(lock, timeout, [this] { return !held_; })) return false;
  return held_ = true;
}

void Qor_TargetMutex::lock() {
  std::unique_lock<std::mutex> lock(mutex_);
  freed_.wait(lock, [this] { return !held_; });
  held_ = true;
}

void Qor_TargetMutex::unlock() {
  const std::lock_guard<std::mutex> guard(mutex_);
  held_ = false;
  freed_.notify_one();
}

}  // namespace QorRT
