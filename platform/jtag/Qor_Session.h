// One open session: its target lock, its cable, and who listens to it.
#pragma once

#include <memory>
#include <mutex>
#include <vector>

#include "QorJtag_Host.h"
#include "platform/jtag/Qor_LinkRecord.h"
#include "platform/jtag/Qor_TargetMutex.h"

namespace QorRT {

class Qor_Session {
 public:
  using CloseHook = void (*)(unsigned session) noexcept;

  /// Owns `cable`, which must not be null.
  explicit Qor_Session(std::unique_ptr<Qor_Cable> cable);

  /// Serialises the use of the cable, and guards isClosed().
  Qor_TargetMutex& targetLock() { return targetLock_; }
  bool isClosed() const { return closed_; }
  void markClosed() { closed_ = true; }

  /// For the holder of the target lock, until the session is closed.
  Qor_Cable& cable() { return *cable_; }

  Qor_LinkRecord& record() { return record_; }

  /// What was on the chain when the session was opened.
  const std::vector<Qor_Device>& devices() const { return devices_; }

  /// Replaces the handler; an empty one means the default.
  void setHandler(QorJtag_MessageHandler handler);

  /// Null for the default. A handler that is being called outlives its replacement.
  std::shared_ptr<const QorJtag_MessageHandler> handler();

  /// Keeps the hook once. False, keeping nothing, when the hooks have run.
  bool addCloseHook(CloseHook hook);

  /// Calls every hook with the handle, then destroys the cable. For the thread that marked it closed.
  void shutDown(unsigned session) noexcept;

 private:
  std::vector<CloseHook> takeHooks() noexcept;

  Qor_TargetMutex targetLock_;
  bool closed_ = false;
  std::unique_ptr<Qor_Cable> cable_;
  const std::vector<Qor_Device> devices_;
  Qor_LinkRecord record_;

  std::mutex mutex_;  // guards what follows, never locked while foreign code runs
  std::shared_ptr<const QorJtag_MessageHandler> handler_;
  std::vector<CloseHook> hooks_;
  bool hooksTaken_ = false;
};

}  // namespace QorRT
