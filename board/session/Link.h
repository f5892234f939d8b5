/// @file
/// The session with a board, as RAII, and its failures as exceptions.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "QorVIO_CoreFields.h"
#include "board/Export.h"
#include "board/session/Stop.h"

namespace qor {

/// Throws "cannot open the cable URL: why": WrongUse for a malformed URL, else Failure. `stop` ends every wait of the
/// cable, as a failure; it must be of use as long as the cable.
QORBOARD_API std::unique_ptr<QorRT::Qor_Cable> openCable(const std::string& url, StopFunction stop = {});

/// Keeps the session's messages, and throws them as Failure.
class QORBOARD_API Link {
 public:
  /// Opens a session on the cable. `url` is only kept: what is remembered of the board is kept under it.
  explicit Link(std::unique_ptr<QorRT::Qor_Cable> cable, std::string url = {});
  Link(const Link&) = delete;
  Link& operator=(const Link&) = delete;
  ~Link();

  unsigned session() const { return session_; }
  const std::string& url() const { return url_; }
  std::vector<QorRT::Qor_Device> devices() const;

  /// Throws Failure with the session's message, for a return code that is not 0.
  void check(unsigned code);

  /// The last message, forgotten by this; empty when there was none.
  std::string takeMessage();

 private:
  void listen();

  unsigned session_;
  std::string url_;
  std::string message_;
};

/// One core of a hub.
struct FoundCore {
  QOR_CORE_REF ref;
  QORVIO_CORE_INFO info;  ///< of a core of another type, the first five fields
  bool isVio() const { return info.core_type == 9; }
};

/// Every core of every hub on the chain, in address order. User registers without a hub are no failure; any other one is.
QORBOARD_API std::vector<FoundCore> findCores(Link& link);

/// A VIO core that answers at a second address too.
struct CoreFoundTwice {
  QOR_CORE_REF ref, again;
};

/// Those among the cores that findCores() found. Where the same core may be at two addresses a mark is left in it, which
/// changes no output.
QORBOARD_API std::vector<CoreFoundTwice> coresFoundTwice(Link& link, const std::vector<FoundCore>& cores);

/// "0.1.0 and 0.2.0 are the same core"
QORBOARD_API std::string foundTwiceText(const CoreFoundTwice& core);

/// The first VIO core. Throws Failure when there is none.
QORBOARD_API QOR_CORE_REF firstVioCore(Link& link);

/// Reads the core's status word afresh; the core need not be set up. Throws Failure.
QORBOARD_API QORVIO_CORE_INFO readInfo(Link& link, QOR_CORE_REF ref);

/// After a call that failed for a core: throws Failure with the session's message, and before it what is at the address if
/// that is no VIO core.
[[noreturn]] QORBOARD_API void failAt(Link& link, QOR_CORE_REF ref);

}  // namespace qor
