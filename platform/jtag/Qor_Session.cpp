#include "platform/jtag/Qor_Session.h"

#include <algorithm>
#include <utility>

#include "os/Cancel.h"

namespace QorRT {

Qor_Session::Qor_Session(std::unique_ptr<Qor_Cable> cable)
    : cable_(std::move(cable)), devices_(cable_->devices()) {}

void Qor_Session::setHandler(QorJtag_MessageHandler handler) {
  std::shared_ptr<const QorJtag_MessageHandler> next;
  if (handler) next = std::make_shared<const QorJtag_MessageHandler>(std::move(handler));
  // The old handler is destroyed with `next`, after the mutex is free again.
  const std::lock_guard<std::mutex> guard(mutex_);
  handler_.swap(next);
}

std::shared_ptr<const QorJtag_MessageHandler> Qor_Session::handler() {
  const std::lock_guard<std::mutex> guard(mutex_);
  return handler_;
}

bool Qor_Session::addCloseHook(CloseHook hook) {
  const std::lock_guard<std::mutex> guard(mutex_);
  if (hooksTaken_) return false;
  if (std::find(hooks_.begin(), hooks_.end(), hook) == hooks_.end()) hooks_.push_back(hook);
  return true;
}

std::vector<Qor_Session::CloseHook> Qor_Session::takeHooks() noexcept {
  const std::lock_guard<std::mutex> guard(mutex_);
  hooksTaken_ = true;
  return std::move(hooks_);
}

void Qor_Session::shutDown(unsigned session) noexcept {
  const os::CancelLater guard;
  for (const CloseHook hook : takeHooks()) hook(session);
  cable_.reset();
}

}  // namespace QorRT
