// What all cables to a server have in common: they find out what is on the chain when they connect, and connect anew
// after a failure.
#pragma once

#include <optional>
#include <utility>
#include <vector>

#include "Qor_Cable.h"
#include "platform/jtag/cable/wire/Deadline.h"
#include "platform/jtag/cable/wire/WireDevice.h"
#include "platform/jtag/cable/wire/WireUrl.h"

namespace QorRT {

/// A failure ends the connection; the next queue connects first, and fails when the chain is another one than when the
/// cable was opened (as far as its server has looked since).
class WireCable : public Qor_Cable {
 public:
  const std::vector<Qor_Device>& devices() const override { return heads_; }
  bool isStopped() const override { return stop_ && stop_(); }

 protected:
  /// Throws what boardDevices() throws for the board file of the URL.
  WireCable(WireUrl url, StopFunction stop);

  /// For the constructor of a cable that can connect.
  void open();

  /// For an exchange of so many TCKs, on the slowest adapter that is waited for.
  Deadline deadlineOf(std::size_t tcks) const;

  /// For the last words to a server, whose answer changes nothing.
  Deadline leaveTime() const;

  /// Whether the instruction of an IR scan is selected already. From then on it is taken to be. For cables whose chain
  /// nobody else uses.
  bool isSelected(const Qor_Scan& ir);

  const WireUrl& url() const { return url_; }
  const StopFunction& stop() const { return stop_; }

  /// What the board file says of the chain; empty without one.
  const std::vector<DeviceEntry>& board() const { return board_; }

  /// What is on the chain, with the opcodes of its user registers.
  const std::vector<WireDevice>& wireDevices() const { return devices_; }

 private:
  void run(std::vector<Qor_Scan>& scans) override;

  /// Connects and returns what is on the chain. Throws what went wrong.
  virtual std::vector<WireDevice> connect() = 0;

  /// Runs the steps on a connection. Throws what went wrong.
  virtual void exchange(std::vector<Qor_Scan>& scans, const Deadline& deadline) = 0;

  /// Ends the connection, if there is one.
  virtual void disconnect() noexcept = 0;

  void keep(std::vector<WireDevice> found);
  void giveUp() noexcept;

  const WireUrl url_;
  const StopFunction stop_;
  const std::vector<DeviceEntry> board_;
  bool connected_ = false;
  std::optional<std::pair<unsigned, unsigned>> selected_;  // device and user chain
  std::vector<WireDevice> devices_;
  std::vector<Qor_Device> heads_;
};

}  // namespace QorRT
