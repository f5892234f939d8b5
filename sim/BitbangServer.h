/// @file
/// A board's wires over TCP, for one client after another.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <string>

#include "Pins.h"

namespace qorsim {

/// The remote_bitbang protocol, one character a request:
///
/// | Characters | What they ask for                                                          |
/// |------------|----------------------------------------------------------------------------|
/// | 0 to 7     | set the wires: TCK + TMS + TDI = 4 + 2 + 1                                 |
/// | R          | TDO, answered by 0 or 1                                                    |
/// | r s t u    | TRST and SRST: neither, SRST, TRST, both; there is nothing that SRST resets |
/// | B b        | a light on and off                                                          |
/// | Q          | the end of the connection                                                  |
///
/// The board stays as the last client left it. Used by one thread at a time.
class QOR_API BitbangServer {
 public:
  /// Listens on the loopback interface; port 0 takes any that is free. `pins` must outlive the server. `idleLimit`:
  /// see serve(). Throws runtime_error when the port cannot be had.
  BitbangServer(Pins& pins, std::uint16_t port,
                std::chrono::milliseconds idleLimit = std::chrono::milliseconds(2000));
  BitbangServer(const BitbangServer&) = delete;
  BitbangServer& operator=(const BitbangServer&) = delete;
  ~BitbangServer();

  /// The port on which it listens.
  std::uint16_t port() const { return port_; }

  /// Serves until `stop`, which is asked several times a second and after each signal, says so. Clients that come
  /// meanwhile wait for the one before to leave; when that is silent for the idle limit while another one waits,
  /// its connection is closed. `report`, unless it is empty, is given why a connection was closed from this end. Throws
  /// what `pins`, `stop` and `report` throw, and runtime_error when the network fails.
  void serve(const std::function<bool()>& stop, const std::function<void(const std::string&)>& report = {});

 private:
  std::string serveClient(int socket, const std::function<bool()>& stop);

  Pins& pins_;
  std::chrono::milliseconds idleLimit_;
  int listener_;
  std::uint16_t port_ = 0;
};

}  // namespace qorsim
