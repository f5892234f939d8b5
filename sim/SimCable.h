/// @file
/// The cable to a simulated board, in process.
#pragma once

#include <cstddef>
#include <memory>
#include <vector>

#include "Qor_Cable.h"

namespace qorsim {

class Chain;

/// Drives the simulated chain with the scans that a real adapter would send: padded for the devices in
/// BYPASS, bit by bit through all of them.
///
/// The design clock of the board ticks once for every `tcksPerClock` TCKs that count: those of idle(), and in a DR
/// scan those from the end of a frame to the bit of the answer that ends the wait, ten when nothing waits. The same
/// queue always gives the same bits.
class QOR_API SimCable : public QorRT::Qor_Cable {
 public:
  /// `devices` says what is on the chain. The builder in Sim.h makes both.
  SimCable(std::vector<QorRT::Qor_Device> devices, std::unique_ptr<Chain> chain);
  ~SimCable() override;

  const std::vector<QorRT::Qor_Device>& devices() const override { return devices_; }

  /// From now on the design clock ticks once in so many TCKs; 0 stops it.
  void setTcksPerClock(unsigned tcks);

  /// How many queues have run so far, and how many IR and DR scans were in them.
  /// @{
  std::size_t exchanges() const { return exchanges_; }
  std::size_t scans() const { return scans_; }
  /// @}

 private:
  void run(std::vector<QorRT::Qor_Scan>& scans) override;
  void runIr(const QorRT::Qor_Scan& scan);
  void runDr(QorRT::Qor_Scan& scan);

  std::vector<QorRT::Qor_Device> devices_;
  std::unique_ptr<Chain> chain_;
  std::size_t exchanges_ = 0;
  std::size_t scans_ = 0;
};

}  // namespace qorsim
