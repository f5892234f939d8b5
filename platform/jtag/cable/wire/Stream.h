// A connection to a server, on which no wait is without end.
#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <string_view>

#include "Qor_Cable.h"
#include "platform/jtag/cable/wire/Deadline.h"

namespace QorRT {

/// Where a server listens.
struct Endpoint {
  std::string host;
  std::string port;

  std::string text() const { return host + ":" + port; }
};

/// Every failure is a runtime_error that names the server and what was seen; the connection is of no use afterwards.
class Stream {
 public:
  /// The socket, and whatever else is to be served while an exchange waits.
  struct Link;

  /// Connects over TCP, without delay of small packets. `stop` may be empty, and ends every wait.
  Stream(const Endpoint& endpoint, const Deadline& deadline, StopFunction stop);

  /// On a socket that is connected; `name` is what messages call the server.
  Stream(std::unique_ptr<Link> link, std::string name, StopFunction stop);

  ~Stream();
  Stream(const Stream&) = delete;
  Stream& operator=(const Stream&) = delete;

  /// Sends `out` and meanwhile receives until `count` bytes have come; more than that is a failure.
  std::string exchange(std::string_view out, std::size_t count, const Deadline& deadline);

  /// Sends `out`, then receives up to the first `end`, which is not returned. Anything after it is a failure, and so
  /// is an answer of more than `most` bytes.
  std::string ask(std::string_view out, char end, std::size_t most, const Deadline& deadline);

  Link& link() { return *link_; }

 private:
  struct Wanted;
  struct Places;

  void connect(const Endpoint& endpoint, const Deadline& deadline);
  Places find(const Endpoint& endpoint, const Deadline& deadline);
  std::string transfer(std::string_view out, const Wanted& wanted, const Deadline& deadline);
  void runUntil(const std::function<bool()>& done, const std::function<std::string()>& seen,
                const Deadline& deadline);
  void requireTime(const std::function<std::string()>& seen, const Deadline& deadline);
  [[noreturn]] void fail(const std::string& seen) const;

  std::unique_ptr<Link> link_;
  std::string name_;
  StopFunction stop_;
  bool isSilent_ = false;  // whether the server has taken the connection and said nothing at all
};

}  // namespace QorRT
