#include "sim/BitbangClient.h"

#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>
#include <cerrno>
#include <stdexcept>
#include <system_error>
#include <utility>

namespace qorsim {
namespace {

constexpr int pollMilliseconds = 100;
constexpr std::size_t mostAnswers = 16 << 20;  // a client that never reads is not listened to beyond these

std::string shown(char character) {
  if (character > ' ' && character <= '~') return std::string("\"") + character + '"';
  return "number " + std::to_string(static_cast<unsigned char>(character));
}

}  // namespace

bool awaitEvents(int socket, short events, short& found, const std::function<bool()>& stop) {
  while (!stop()) {
    pollfd entry{socket, events, 0};
    const int count = ::poll(&entry, 1, pollMilliseconds);
    found = entry.revents;
    if (count > 0) return true;
    if (count < 0 && errno != EINTR)
      throw std::runtime_error("cannot wait for the client: " + std::generic_category().message(errno));
  }
  return false;
}

BitbangClient::~BitbangClient() {
  ::close(socket_);
}

std::string BitbangClient::serve(const std::function<bool()>& stop) {
  while (!leaving_ || !answers_.empty()) {
    const bool listening = !leaving_ && answers_.size() < mostAnswers;
    const int wanted = (listening ? POLLIN : 0) | (answers_.empty() ? 0 : POLLOUT);
    short found = 0;
    if (!awaitEvents(socket_, static_cast<short>(wanted), found, stop)) break;
    if (listening && (found & ~POLLOUT) != 0) receive();
    if (!answers_.empty()) send();
  }
  return std::move(reason_);
}

void BitbangClient::receive() {
  const ssize_t count = ::recv(socket_, block_.data(), block_.size(), 0);
  if (count == 0) leaving_ = true;
  if (count < 0) lose("cannot receive from the client: ");
  if (count > 0) lastMoved_ = Clock::now();
  for (ssize_t i = 0; i < count && !leaving_; ++i) obey(block_[static_cast<std::size_t>(i)]);
}

void BitbangClient::send() {
  const ssize_t count = ::send(socket_, answers_.data(), answers_.size(), MSG_NOSIGNAL);
  if (count < 0) return lose("cannot send to the client: ");
  lastMoved_ = Clock::now();
  answers_.erase(0, static_cast<std::size_t>(count));
}

void BitbangClient::obey(char request) {
  if (request >= '0' && request <= '7')
    pins_.write((request & 4) != 0, (request & 2) != 0, (request & 1) != 0);
  else if (request == 'R')
    answers_ += pins_.tdo() ? '1' : '0';
  else if (request >= 'r' && request <= 'u')
    pins_.setTrst(request >= 't');
  else if (request == 'Q')
    leaving_ = true;
  else if (request == 'B' || request == 'b')
    pins_.setLight(request == 'B');
  else
    sendAway("the client sent a character that means nothing: " + shown(request));
}

void BitbangClient::sendAway(std::string reason) {
  leaving_ = true;
  reason_ = std::move(reason);
}

// After a failed call; one that is only to be made again loses nothing.
void BitbangClient::lose(const std::string& what) {
  const int error = errno;
  if (error == EAGAIN || error == EWOULDBLOCK || error == EINTR) return;
  answers_.clear();
  sendAway(what + std::generic_category().message(error));
}

}  // namespace qorsim
