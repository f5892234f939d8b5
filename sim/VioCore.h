// The VIO core and the design behind it.
#pragma once

#include <memory>

#include "SimCoreDescription.h"
#include "sim/Core.h"
#include "sim/InputPort.h"
#include "sim/PulseTrains.h"

namespace qorsim {

/// Codes 02 (write), 03 and 05 (snapshot) and 04 (acknowledge). Asynchronous outputs take their values at
/// once; pulse trains and snapshots wait for the next design clock. That clock moves the outputs, lets the
/// design answer, samples the inputs and then takes the snapshot.
class VioCore : public Core {
 public:
  explicit VioCore(const CoreDescription& core);

  Reply command(unsigned code, const Bits& payload, bool resultSeen) override;
  Bits result(unsigned code) const override;
  bool pending() const override { return snapshotPending_ || syncOut_.pending(); }
  void clock() override;

 private:
  Reply write(const Bits& payload);
  Reply requestSnapshot(bool alwaysMerge);
  Reply acknowledge(bool resultSeen);
  void takeSnapshot();
  Ports ports();

  Bits asyncOut_;
  PulseTrains syncOut_;
  InputPort asyncIn_;
  InputPort syncIn_;
  std::shared_ptr<Design> design_;

  bool snapshotPending_ = false;
  bool alwaysMerge_ = false;  // of the pending snapshot
  bool acknowledged_ = false;
};

}  // namespace qorsim
