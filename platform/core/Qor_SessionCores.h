// What libQorCore keeps of each session: its cores, and what it remembers of transfers with each address.
#pragma once

#include <map>
#include <memory>
#include <mutex>

#include "QorCore.h"
#include "platform/core/Qor_CoreLink.h"

namespace QorRT {

struct Qor_AddressOrder {
  bool operator()(const QOR_CORE_REF& left, const QOR_CORE_REF& right) const noexcept;
};

/// One session's part. Forgotten when the session is closed; its cores are destroyed then.
class Qor_SessionCores {
 public:
  /// The session's part, made if there is none yet. Throws logic_error when the session is unknown or closed.
  static std::shared_ptr<Qor_SessionCores> open(unsigned session);

  /// Null when nothing was ever kept of the session, or it is closed.
  static std::shared_ptr<Qor_SessionCores> find(unsigned session) noexcept;

  Qor_Core* core(const QOR_CORE_REF& coreRef);

  /// Owns the core from a normal return on. Throws logic_error when its address is taken.
  void add(Qor_Core* core);

  /// Hands back the core if it is here. Compares pointers only: `core` may be destroyed already.
  std::unique_ptr<Qor_Core> take(const Qor_Core* core) noexcept;

  /// What is remembered of the address, for the holder of the session's target lock.
  Qor_CoreLink& link(const QOR_CORE_REF& coreRef);

  /// How many synchronous outputs the core at the address has; 0 while the list has none there.
  unsigned syncOutputCount(const QOR_CORE_REF& coreRef);

 private:
  static void forget(unsigned session) noexcept;

  std::mutex mutex_;  // never locked while a core is destroyed
  std::map<QOR_CORE_REF, std::unique_ptr<Qor_Core>, Qor_AddressOrder> cores_;
  std::map<QOR_CORE_REF, Qor_CoreLink, Qor_AddressOrder> links_;
  const unsigned tagAbove_ = drawTagAbove();
};

/// "device 0, user chain 1, core 2"
std::string addressText(const QOR_CORE_REF& coreRef);

}  // namespace QorRT
