/// @file
/// A cable that counts what goes through another one.
#pragma once

#include <cstdint>
#include <memory>

#include "QorJtag_Host.h"
#include "board/Export.h"

namespace qor {

struct Traffic {
  std::uint64_t exchanges = 0;
  std::uint64_t scans = 0;  ///< IR and DR
  std::uint64_t bits = 0;   ///< of the addressed device, in IR and DR scans
  std::uint64_t idle = 0;   ///< TCKs in Run-Test/Idle
};

class QORBOARD_API CountingCable : public QorRT::Qor_Cable {
 public:
  /// Counts into `traffic`, which must outlive the cable.
  CountingCable(std::unique_ptr<QorRT::Qor_Cable> cable, Traffic& traffic)
      : cable_(std::move(cable)), traffic_(traffic) {}

  const std::vector<QorRT::Qor_Device>& devices() const override { return cable_->devices(); }
  bool isStopped() const override { return cable_->isStopped(); }

 protected:
  void run(std::vector<QorRT::Qor_Scan>& scans) override;

 private:
  std::size_t forward(const QorRT::Qor_Scan& scan);

  std::unique_ptr<QorRT::Qor_Cable> cable_;
  Traffic& traffic_;
};

}  // namespace qor
