// A cable whose lines flip bits at random.
#pragma once

#include <memory>
#include <random>
#include <utility>

#include "Qor_Cable.h"

namespace bench {

class NoisyCable : public QorRT::Qor_Cable {
 public:
  /// `rate` is the share of bits that flip, on TDI when `sent`, else on TDO.
  NoisyCable(std::unique_ptr<QorRT::Qor_Cable> cable, double rate, bool sent)
      : cable_(std::move(cable)), isSent_(sent), gap_(rate), next_(gap_(random_)) {}

  const std::vector<QorRT::Qor_Device>& devices() const override { return cable_->devices(); }

  std::size_t flips() const { return flips_; }

 private:
  void run(std::vector<QorRT::Qor_Scan>& scans) override {
    cable_->drop();
    for (QorRT::Qor_Scan& scan : scans) {
      if (scan.kind == QorRT::Qor_Scan::Kind::ir) cable_->scanIr(scan.device, scan.userChain);
      if (scan.kind != QorRT::Qor_Scan::Kind::dr) continue;
      if (isSent_) disturb(scan.out, scan.bitCount);
      const std::size_t number = cable_->scanDr(scan.device, scan.out, scan.bitCount, scan.capture);
      if (scan.capture) scan.in = cable_->captured(number);
      if (!isSent_) disturb(scan.in, scan.bitCount);
    }
    cable_->flush();
  }

  void disturb(std::vector<unsigned char>& bits, std::size_t count) {
    for (; next_ < count; next_ += gap_(random_) + 1, ++flips_)
      bits[next_ / 8] = static_cast<unsigned char>(bits[next_ / 8] ^ 1U << next_ % 8);
    next_ -= count;
  }

  std::unique_ptr<QorRT::Qor_Cable> cable_;
  const bool isSent_;
  std::mt19937_64 random_{7};
  std::geometric_distribution<std::size_t> gap_;
  std::size_t next_;  // the next bit that flips
  std::size_t flips_ = 0;
};

}  // namespace bench
