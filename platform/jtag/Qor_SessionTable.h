// The open sessions by handle.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>

#include "platform/jtag/Qor_Session.h"

namespace QorRT {

class Qor_SessionTable {
 public:
  /// The table of this process. It is never destroyed, so that a host may exit with sessions open.
  static Qor_SessionTable& instance();

  /// Gives the session the next handle.
  unsigned add(std::shared_ptr<Qor_Session> session);

  /// Throws logic_error: unknown, or closed when the handle was open once.
  std::shared_ptr<Qor_Session> get(unsigned session);

  /// Null when there is none.
  std::shared_ptr<Qor_Session> find(unsigned session) noexcept;

  void remove(unsigned session) noexcept;

 private:
  std::mutex mutex_;
  std::map<unsigned, std::shared_ptr<Qor_Session>> sessions_;
  std::uint64_t nextHandle_ = 1;  // wider than a handle, so that it never comes round
};

/// The logic_error for the handle of a session that was open once.
[[noreturn]] void throwClosed(unsigned session);

}  // namespace QorRT
