// What libQorCore keeps of each session: its cores, and the addresses whose last write or read failed.
#pragma once

#include <map>
#include <memory>
#include <mutex>
#include <set>

#include "QorCore.h"

namespace QorRT {

struct Qor_AddressOrder {
  bool operator()(const QOR_CORE_REF& left, const QOR_CORE_REF& right) const noexcept;
};

enum class Qor_Transfer { write, read };

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

  /// Notes a write or a read of the address until it is known to have succeeded. True when an earlier one of
  /// the kind is still noted.
  bool note(Qor_Transfer transfer, const QOR_CORE_REF& coreRef);
  void succeeded(Qor_Transfer transfer, const QOR_CORE_REF& coreRef) noexcept;

 private:
  static void forget(unsigned session) noexcept;

  std::mutex mutex_;  // never held while a core is destroyed
  std::map<QOR_CORE_REF, std::unique_ptr<Qor_Core>, Qor_AddressOrder> cores_;
  std::map<Qor_Transfer, std::set<QOR_CORE_REF, Qor_AddressOrder>> unfinished_;
};

/// "device 0, user chain 1, core 2"
std::string addressText(const QOR_CORE_REF& coreRef);

}  // namespace QorRT
