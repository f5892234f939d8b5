// The session with a board, as RAII, and its failures as exceptions.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "QorJtag_Host.h"
#include "QorVIO.h"

namespace qor {

/// Throws Failure, "cannot open the cable URL: why".
std::unique_ptr<QorRT::Qor_Cable> openCable(const std::string& url);

/// Keeps the session's messages, and throws them as Failure.
class Link {
 public:
  /// Opens a session on the cable.
  explicit Link(std::unique_ptr<QorRT::Qor_Cable> cable);
  Link(const Link&) = delete;
  Link& operator=(const Link&) = delete;
  ~Link();

  unsigned session() const { return session_; }
  std::vector<QorRT::Qor_Device> devices() const;

  /// Throws Failure with the session's message, for a return code that is not 0.
  void check(unsigned code);

  /// The last message, forgotten by this; empty when there was none.
  std::string takeMessage();

 private:
  void listen();

  unsigned session_;
  std::string message_;
};

/// One core that answers behind a user chain.
struct FoundCore {
  QOR_CORE_REF ref;
  QORVIO_CORE_INFO info;  ///< of a core of another type, the first five fields
  bool isVio() const { return info.core_type == 9; }
};

/// Every core behind every hub of the chain, in address order. Hubs that are not there are no failure.
std::vector<FoundCore> findCores(Link& link);

/// "device.chain.index".
std::string refText(QOR_CORE_REF ref);
/// Throws WrongUse.
QOR_CORE_REF parseRef(const std::string& text);

}  // namespace qor
