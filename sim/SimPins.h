/// @file
/// The wires of a simulated board, in process.
#pragma once

#include <memory>

#include "Pins.h"

namespace qorsim {

class Chain;
enum class TapState;

/// A TAP controller in front of the simulated chain. All devices share it, as they share TCK and TMS.
///
/// The design clock of the board ticks as SimCable says; of Run-Test/Idle the TCKs that stay there count, entering
/// and leaving it does not. TDO is 1 outside the two Shift states, as a pull-up makes it.
class QOR_API SimPins : public Pins {
 public:
  /// In Test-Logic-Reset, with TCK low. The builder in Sim.h makes the chain.
  explicit SimPins(std::unique_ptr<Chain> chain);
  ~SimPins() override;

  void write(bool tck, bool tms, bool tdi) override;
  bool tdo() override { return tdo_; }
  void setTrst(bool asserted) override;

 private:
  void rise(bool tms, bool tdi);
  void fall();

  std::unique_ptr<Chain> chain_;
  TapState state_;
  bool tck_ = false;
  bool tdo_ = true;
  bool trst_ = false;
};

}  // namespace qorsim
