// A chain at a remote_bitbang server: one character sets TCK, TMS and TDI, another asks for TDO.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "platform/jtag/cable/bitbang/TckSequence.h"
#include "platform/jtag/cable/wire/WireCable.h"

namespace QorRT {

/// A queue is one exchange, and has run when it is over: it ends with a question. The server has one client, so an
/// instruction stays selected.
class BitbangCable : public WireCable {
 public:
  /// Throws runtime_error when the server cannot be reached or no chain that fits the board file answers.
  BitbangCable(WireUrl url, StopFunction stop);
  ~BitbangCable() override;

 private:
  std::vector<WireDevice> connect() override;
  void exchange(std::vector<Qor_Scan>& scans, const Deadline& deadline) override;
  void disconnect() noexcept override;
  void append(TckSequence& sequence, const Qor_Scan& scan);
  std::string send(const std::string& text, std::size_t captureCount, const Deadline& deadline);

  std::unique_ptr<Stream> stream_;  // null without a connection
};

}  // namespace QorRT
