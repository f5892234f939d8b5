// One connection of a BitbangServer.
#pragma once

#include <array>
#include <chrono>
#include <functional>
#include <string>

#include "Pins.h"

namespace qorsim {

/// Whether poll() finds one of the events, or their failure, on the socket: several times a second `stop` is
/// asked, and ends the wait with false.
bool awaitEvents(int socket, short events, short& found, const std::function<bool()>& stop);

/// Moves the wires as the client says. Answers wait in memory while the client still sends, so that it may send
/// a whole queue before it reads.
class BitbangClient {
 public:
  /// Owns the socket, which does not block.
  BitbangClient(Pins& pins, int socket) : pins_(pins), socket_(socket) {}
  BitbangClient(const BitbangClient&) = delete;
  BitbangClient& operator=(const BitbangClient&) = delete;
  ~BitbangClient();

  /// Until the client leaves or `stop` says so. Returns why it was sent away, or nothing.
  std::string serve(const std::function<bool()>& stop);

  /// How long nothing has come from it or gone to it.
  std::chrono::steady_clock::duration idleTime() const { return Clock::now() - lastMoved_; }

 private:
  using Clock = std::chrono::steady_clock;

  void receive();
  void send();
  void obey(char request);
  void sendAway(std::string reason);
  void lose(const std::string& what);

  Pins& pins_;
  int socket_;
  Clock::time_point lastMoved_ = Clock::now();
  std::array<char, 65536> block_{};
  std::string answers_;
  bool leaving_ = false;  // as soon as the answers have gone
  std::string reason_;
};

}  // namespace qorsim
