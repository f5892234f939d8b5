// What all cables to a server have in common: they find out what stands on the chain when they connect, and
// connect anew after a failure.
#pragma once

#include <memory>
#include <vector>

#include "QorExport.h"
#include "Qor_Cable.h"
#include "platform/jtag/cable/wire/TcpStream.h"
#include "platform/jtag/cable/wire/WireDevice.h"

namespace QorRT {

/// A failure ends the connection; the next queue connects first, and fails when another chain stands there than
/// when the cable was opened (as far as its server has looked since).
class QOR_API WireCable : public Qor_Cable {
 public:
  const std::vector<Qor_Device>& devices() const override { return heads_; }

 protected:
  /// For the constructor of a cable that can connect.
  void open();

  /// How long so many TCKs may take, on the slowest adapter that is waited for.
  static TcpStream::Seconds timeOf(std::size_t tcks) {
    return TcpStream::Seconds(static_cast<double>(tcks) / 20000);
  }

  /// What stands on the chain, with the opcodes of its user registers.
  const std::vector<WireDevice>& wireDevices() const { return devices_; }

 private:
  void run(std::vector<Qor_Scan>& scans) override;

  /// Connects and tells what stands on the chain. Throws what went wrong.
  virtual std::vector<WireDevice> connect() = 0;

  /// Runs the steps on a connection. Throws what went wrong.
  virtual void exchange(std::vector<Qor_Scan>& scans) = 0;

  /// Ends the connection, if there is one.
  virtual void disconnect() noexcept = 0;

  void keep(std::vector<WireDevice> found);

  bool connected_ = false;
  std::vector<WireDevice> devices_;
  std::vector<Qor_Device> heads_;
};

}  // namespace QorRT
