// The cable to wires in process: what a remote_bitbang client does, without the network between.
#pragma once

#include <memory>
#include <vector>

#include "Pins.h"
#include "Qor_Cable.h"
#include "platform/jtag/cable/bitbang/TckSequence.h"

namespace qorrtl {

/// User registers have the opcodes 2 to 5.
class PinsCable : public QorRT::Qor_Cable {
 public:
  /// Resets the TAPs. `pins` must outlive the cable.
  PinsCable(std::vector<QorRT::Qor_Device> devices, qorsim::Pins& pins);

  const std::vector<QorRT::Qor_Device>& devices() const override { return devices_; }

 protected:
  void run(std::vector<QorRT::Qor_Scan>& scans) override;

 private:
  std::vector<unsigned char> play(const QorRT::TckSequence& sequence);

  std::vector<QorRT::Qor_Device> devices_;
  qorsim::Pins& pins_;
};

}  // namespace qorrtl
