#include "platform/core/Qor_SessionCores.h"

#include <algorithm>
#include <stdexcept>
#include <tuple>

#include "platform/jtag/Qor_SessionAccess.h"

namespace QorRT {
namespace {

struct Registry {
  std::mutex mutex;
  std::map<unsigned, std::shared_ptr<Qor_SessionCores>> sessions;
};

/// Never destroyed: a host may exit with sessions open, and cores may belong to libraries unloaded by then.
Registry& registry() {
  static Registry& instance = *new Registry;
  return instance;
}

}  // namespace

bool Qor_AddressOrder::operator()(const QOR_CORE_REF& left, const QOR_CORE_REF& right) const noexcept {
  return std::tie(left.device_index, left.user_chain_number, left.core_index) <
         std::tie(right.device_index, right.user_chain_number, right.core_index);
}

std::shared_ptr<Qor_SessionCores> Qor_SessionCores::open(unsigned session) {
  Registry& all = registry();
  const std::lock_guard<std::mutex> guard(all.mutex);
  if (const auto entry = all.sessions.find(session); entry != all.sessions.end()) return entry->second;
  const auto entry = all.sessions.emplace(session, std::make_shared<Qor_SessionCores>()).first;
  try {
    // Under the mutex: a hook that is called from now on waits for the entry that it has to take out.
    onSessionClose(session, &Qor_SessionCores::forget);
  } catch (...) {
    all.sessions.erase(entry);
    throw;
  }
  return entry->second;
}

std::shared_ptr<Qor_SessionCores> Qor_SessionCores::find(unsigned session) noexcept {
  Registry& all = registry();
  const std::lock_guard<std::mutex> guard(all.mutex);
  const auto entry = all.sessions.find(session);
  return entry == all.sessions.end() ? nullptr : entry->second;
}

void Qor_SessionCores::forget(unsigned session) noexcept {
  Registry& all = registry();
  std::unique_lock<std::mutex> lock(all.mutex);
  const auto closed = all.sessions.extract(session);
  lock.unlock();  // the cores go with `closed`, outside the mutex
}

Qor_Core* Qor_SessionCores::core(const QOR_CORE_REF& coreRef) {
  const std::lock_guard<std::mutex> guard(mutex_);
  const auto entry = cores_.find(coreRef);
  return entry == cores_.end() ? nullptr : entry->second.get();
}

void Qor_SessionCores::add(Qor_Core* core) {
  const QOR_CORE_REF coreRef = core->getCoreRef();
  const std::lock_guard<std::mutex> guard(mutex_);
  const auto [entry, isNew] = cores_.try_emplace(coreRef);
  if (!isNew) throw std::logic_error(addressText(coreRef) + ": there is a core in the list already");
  entry->second.reset(core);
}

std::unique_ptr<Qor_Core> Qor_SessionCores::take(const Qor_Core* core) noexcept {
  const std::lock_guard<std::mutex> guard(mutex_);
  const auto entry = std::find_if(cores_.begin(), cores_.end(),
                                  [core](const auto& kept) { return kept.second.get() == core; });
  if (entry == cores_.end()) return nullptr;
  std::unique_ptr<Qor_Core> taken = std::move(entry->second);
  cores_.erase(entry);
  return taken;
}

Qor_CoreLink& Qor_SessionCores::link(const QOR_CORE_REF& coreRef) {
  const std::lock_guard<std::mutex> guard(mutex_);
  return links_.try_emplace(coreRef, tagAbove_).first->second;
}

unsigned Qor_SessionCores::syncOutputCount(const QOR_CORE_REF& coreRef) {
  const std::lock_guard<std::mutex> guard(mutex_);
  const auto entry = cores_.find(coreRef);
  const auto* const core =
      entry == cores_.end() ? nullptr : dynamic_cast<Qor_SignalCore*>(entry->second.get());
  return core == nullptr ? 0 : core->getCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT);
}

std::string addressText(const QOR_CORE_REF& coreRef) {
  return "device " + std::to_string(coreRef.device_index) + ", user chain " +
         std::to_string(coreRef.user_chain_number) + ", core " + std::to_string(coreRef.core_index);
}

}  // namespace QorRT
