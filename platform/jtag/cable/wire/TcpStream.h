// A TCP connection on which no wait is without end.
#pragma once

#include <chrono>
#include <cstddef>
#include <string>
#include <string_view>

#include "QorExport.h"

namespace QorRT {

/// Where a server listens.
struct Endpoint {
  std::string host;
  std::string port;

  std::string text() const { return host + ":" + port; }
};

/// Every failure is a runtime_error that names the endpoint and what was seen; the connection is of no use
/// afterwards.
class QOR_API TcpStream {
 public:
  using Seconds = std::chrono::duration<double>;

  /// Connects, without delay of small packets. No wait without progress lasts longer than `patience`.
  TcpStream(Endpoint endpoint, Seconds patience);
  ~TcpStream();
  TcpStream(const TcpStream&) = delete;
  TcpStream& operator=(const TcpStream&) = delete;

  /// Sends `out` and meanwhile receives until `count` bytes have come; more than that is a failure. `extra` is
  /// added to the patience.
  std::string exchange(std::string_view out, std::size_t count, Seconds extra = Seconds(0));

  /// Sends `out`, then receives up to the first `end`, which is not returned; `extra` is added to the patience.
  /// Anything behind it is a failure.
  std::string ask(std::string_view out, char end, Seconds extra = Seconds(0));

 private:
  [[noreturn]] void fail(const std::string& seen) const;
  std::size_t sendSome(std::string_view out);
  bool receiveSome(std::string& in);

  Endpoint endpoint_;
  Seconds patience_;
  int socket_ = -1;
};

}  // namespace QorRT
