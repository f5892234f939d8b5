#include "BitbangServer.h"

#include <fcntl.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>
#include <cerrno>
#include <stdexcept>
#include <system_error>

#include "sim/BitbangClient.h"

namespace qorsim {
namespace {

[[noreturn]] void failPort(int listener, std::uint16_t port) {
  const std::string why = std::generic_category().message(errno);
  if (listener >= 0) ::close(listener);
  throw std::runtime_error("cannot listen on port " + std::to_string(port) + ": " + why);
}

void setOption(int socket, int level, int option) {
  const int on = 1;
  ::setsockopt(socket, level, option, &on, sizeof on);
}

sockaddr_in loopbackAddress(std::uint16_t port) {
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  address.sin_port = htons(port);
  return address;
}

// The socket of a client that has come, or -1 when it has gone again.
int acceptClient(int listener) {
  const int client = ::accept4(listener, nullptr, nullptr, SOCK_CLOEXEC | SOCK_NONBLOCK);
  if (client >= 0) {
    setOption(client, IPPROTO_TCP, TCP_NODELAY);
    return client;
  }
  if (errno != EAGAIN && errno != EINTR && errno != ECONNABORTED)
    throw std::runtime_error("cannot accept a client: " + std::generic_category().message(errno));
  return -1;
}

bool isClientWaiting(int listener) {
  pollfd entry{listener, POLLIN, 0};
  return ::poll(&entry, 1, 0) > 0;
}

}  // namespace

BitbangServer::BitbangServer(Pins& pins, std::uint16_t port, std::chrono::milliseconds idleLimit)
    : pins_(pins),
      idleLimit_(idleLimit),
      listener_(::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0)) {
  if (listener_ < 0) failPort(listener_, port);
  setOption(listener_, SOL_SOCKET, SO_REUSEADDR);
  sockaddr_in address = loopbackAddress(port);
  socklen_t size = sizeof address;
  auto* const plain = reinterpret_cast<sockaddr*>(&address);
  if (::bind(listener_, plain, size) != 0 || ::listen(listener_, SOMAXCONN) != 0 ||
      ::getsockname(listener_, plain, &size) != 0)
    failPort(listener_, port);
  port_ = ntohs(address.sin_port);
}

BitbangServer::~BitbangServer() {
  ::close(listener_);
}

void BitbangServer::serve(const std::function<bool()>& stop,
                          const std::function<void(const std::string&)>& report) {
  short found = 0;
  while (awaitEvents(listener_, POLLIN, found, stop)) {
    const int socket = acceptClient(listener_);
    if (socket < 0) continue;
    const std::string reason = serveClient(socket, stop);
    if (!reason.empty() && report) report(reason);
  }
}

std::string BitbangServer::serveClient(int socket, const std::function<bool()>& stop) {
  BitbangClient client(pins_, socket);
  bool makesRoom = false;
  const std::string reason = client.serve([&] {
    makesRoom = client.idleTime() >= idleLimit_ && isClientWaiting(listener_);
    return makesRoom || stop();
  });
  return makesRoom ? "the client was idle while another one waited" : reason;
}

}  // namespace qorsim
