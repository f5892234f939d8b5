// The VIO core and the design around it.
#pragma once

#include <memory>

#include "SimCoreDescription.h"
#include "sim/Core.h"
#include "sim/InputPort.h"
#include "sim/PulseTrains.h"

namespace qorsim {

/// Codes 02 (write), 03 and 05 (snapshot), and their repeats 0A, 0B and 0D. Asynchronous outputs take their values
/// at once; pulse trains and snapshots wait for the next design clock. That clock moves the outputs, lets the
/// design answer, samples the inputs and then takes the snapshot.
class VioCore : public Core {
 public:
  explicit VioCore(const CoreDescription& core);

  Reply reply(const Command& command) const override;
  std::size_t payloadBits() const override;
  void begin(const Command& command, const Bits& payload) override;
  bool waits(unsigned code) const override;
  bool repeats(unsigned code) const override;
  Bits data(unsigned code) const override;
  void delivered(unsigned code) override;
  void clock() override;

 private:
  Reply replyToWrite() const;
  Reply replyToRepeatedWrite(unsigned tag) const;
  void write(const Bits& payload);
  void requestSnapshot(bool alwaysMerges);
  void takeSnapshot();
  Ports ports();

  Bits asyncOut_;
  PulseTrains syncOut_;
  InputPort asyncIn_;
  InputPort syncIn_;
  std::shared_ptr<Design> design_;

  unsigned writeTag_ = 0;  // of the last write that was obeyed
  unsigned readTag_ = 0;   // of the last read that asked for a snapshot
  bool snapshotPending_ = false;
  bool merges_ = false;    // the last snapshot, or the pending one, adds to the activity of the record
  bool delivered_ = true;  // the record, and nothing has been asked for since
};

}  // namespace qorsim
