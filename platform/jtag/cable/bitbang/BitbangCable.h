// A chain behind a remote_bitbang server: one character sets TCK, TMS and TDI, another asks for TDO.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "QorExport.h"
#include "platform/jtag/cable/bitbang/TckSequence.h"
#include "platform/jtag/cable/wire/WireCable.h"
#include "platform/jtag/cable/wire/WireUrl.h"

namespace QorRT {

/// A queue is one exchange, and has run when it is over: it ends with a question.
class QOR_API BitbangCable : public WireCable {
 public:
  /// Throws runtime_error when the server cannot be reached or no chain that fits the board file answers.
  explicit BitbangCable(WireUrl url);
  ~BitbangCable() override;

 private:
  std::vector<WireDevice> connect() override;
  void exchange(std::vector<Qor_Scan>& scans) override;
  void disconnect() noexcept override;
  void append(TckSequence& sequence, const Qor_Scan& scan) const;
  std::string send(const TckSequence& sequence);

  WireUrl url_;
  std::unique_ptr<TcpStream> stream_;  // null without a connection
};

}  // namespace QorRT
