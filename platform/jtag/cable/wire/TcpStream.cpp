#include "platform/jtag/cable/wire/TcpStream.h"

#include <fcntl.h>
#include <netdb.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cmath>
#include <stdexcept>
#include <system_error>
#include <utility>

namespace QorRT {
namespace {

std::string reason(int error) {
  return std::generic_category().message(error);
}

bool wouldBlock(int error) {
  return error == EAGAIN || error == EWOULDBLOCK || error == EINTR;
}

// With one decimal, rounded up.
std::string secondsText(TcpStream::Seconds seconds) {
  const long tenths = std::lround(std::ceil(seconds.count() * 10));
  const std::string decimal = tenths % 10 == 0 ? "" : "." + std::to_string(tenths % 10);
  return std::to_string(tenths / 10) + decimal + " s";
}

struct Addresses {
  ~Addresses() {
    if (first != nullptr) freeaddrinfo(first);
  }
  addrinfo* first = nullptr;
};

// A socket that is closed unless it is kept.
struct SocketGuard {
  ~SocketGuard() {
    if (socket >= 0) close(socket);
  }
  int keep() { return std::exchange(socket, -1); }
  int socket;
};

// False when the time is over first; errors on the socket count as ready.
bool waitFor(int socket, short events, TcpStream::Seconds patience, short& ready) {
  using std::chrono::steady_clock;
  const auto end = steady_clock::now() + std::chrono::duration_cast<steady_clock::duration>(patience);
  pollfd wanted{socket, events, 0};
  int count = -1;
  do {
    const auto left = std::chrono::ceil<std::chrono::milliseconds>(end - steady_clock::now()).count();
    count = poll(&wanted, 1, static_cast<int>(std::max<long long>(left, 0)));
  } while (count < 0 && errno == EINTR);
  ready = wanted.revents;
  return count != 0;
}

// Returns an error number, 0 when the socket is connected.
int connectWithin(int socket, const addrinfo& address, TcpStream::Seconds patience) {
  if (connect(socket, address.ai_addr, address.ai_addrlen) == 0) return 0;
  if (errno != EINPROGRESS) return errno;
  short ready = 0;
  if (!waitFor(socket, POLLOUT, patience, ready)) return ETIMEDOUT;
  int error = 0;
  socklen_t length = sizeof error;
  return getsockopt(socket, SOL_SOCKET, SO_ERROR, &error, &length) == 0 ? error : errno;
}

}  // namespace

TcpStream::TcpStream(Endpoint endpoint, Seconds patience)
    : endpoint_(std::move(endpoint)), patience_(patience) {
  addrinfo hints{};
  hints.ai_socktype = SOCK_STREAM;
  Addresses addresses;
  const int unknown = getaddrinfo(endpoint_.host.c_str(), endpoint_.port.c_str(), &hints, &addresses.first);
  if (unknown != 0) fail(std::string("cannot be found: ") + gai_strerror(unknown));
  int error = 0;
  for (const addrinfo* each = addresses.first; each != nullptr && socket_ < 0; each = each->ai_next) {
    SocketGuard guard{socket(each->ai_family, SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, 0)};
    error = guard.socket < 0 ? errno : connectWithin(guard.socket, *each, patience_);
    if (error == 0) socket_ = guard.keep();
  }
  if (socket_ < 0) fail("cannot be reached: " + reason(error));
  const int yes = 1;
  setsockopt(socket_, IPPROTO_TCP, TCP_NODELAY, &yes, sizeof yes);
}

TcpStream::~TcpStream() {
  close(socket_);
}

std::string TcpStream::exchange(std::string_view out, std::size_t count, Seconds extra) {
  std::string in;
  while (!out.empty() || in.size() < count) {
    short ready = 0;
    const auto events = static_cast<short>(out.empty() ? POLLIN : POLLIN | POLLOUT);
    if (!waitFor(socket_, events, patience_ + extra, ready))
      fail("gave " + std::to_string(in.size()) + " of " + std::to_string(count) +
           " answers, then nothing for " + secondsText(patience_ + extra));
    if ((ready & POLLOUT) != 0) out.remove_prefix(sendSome(out));
    if ((ready & ~POLLOUT) != 0 && !receiveSome(in))
      fail("closed the connection after " + std::to_string(in.size()) + " of " + std::to_string(count) +
           " answers");
  }
  if (in.size() > count)
    fail("gave " + std::to_string(in.size()) + " answers where " + std::to_string(count) + " were due");
  return in;
}

std::string TcpStream::ask(std::string_view out, char end, Seconds extra) {
  std::string in;
  while (!out.empty() || in.find(end) == std::string::npos) {
    short ready = 0;
    const auto events = static_cast<short>(out.empty() ? POLLIN : POLLIN | POLLOUT);
    if (!waitFor(socket_, events, patience_ + extra, ready))
      fail("did not answer within " + secondsText(patience_ + extra));
    if ((ready & POLLOUT) != 0) out.remove_prefix(sendSome(out));
    if ((ready & ~POLLOUT) != 0 && !receiveSome(in)) fail("closed the connection before it answered");
  }
  if (in.find(end) + 1 != in.size()) fail("answered more than it was asked");
  in.pop_back();
  return in;
}

void TcpStream::fail(const std::string& seen) const {
  throw std::runtime_error(endpoint_.text() + " " + seen);
}

std::size_t TcpStream::sendSome(std::string_view out) {
  const ssize_t sent = send(socket_, out.data(), out.size(), MSG_NOSIGNAL);
  if (sent >= 0) return static_cast<std::size_t>(sent);
  if (!wouldBlock(errno)) fail("closed the connection: " + reason(errno));
  return 0;
}

// False at the end of the stream.
bool TcpStream::receiveSome(std::string& in) {
  std::array<char, 65536> block;  // NOLINT(cppcoreguidelines-pro-type-member-init): recv fills what is used
  const ssize_t received = recv(socket_, block.data(), block.size(), 0);
  if (received > 0) in.append(block.data(), static_cast<std::size_t>(received));
  if (received < 0 && !wouldBlock(errno)) fail("closed the connection: " + reason(errno));
  return received != 0;
}

}  // namespace QorRT
