/// @file
/// The cable interface: one board's scan chain, as the host reaches it. The scans of a cable are queued and
/// run together, so that a whole sequence is one exchange with the adapter.
///
/// Conventions
///
///  1. Bits are little-endian arrays: bit i is bit (i mod 8) of byte i / 8. Bit 0 is the first on the wire.
///  2. Device 0 is the one nearest to TDO.
///  3. A cable is used by one thread at a time: the holder of its session's target lock.
///  4. Lengths count the bits of the addressed device alone; a cable adds and takes away what the bypassed
///     devices need.
#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

#include "QorExport.h"

namespace QorRT {

/// One device on the chain.
struct Qor_Device {
  unsigned idcode = 0;    ///< 0 when the device has none
  std::string name;       ///< for people; may be empty
  unsigned irLength = 0;  ///< bits
};

/// The number as people write it: "0A5F1093".
QOR_API std::string idcodeText(unsigned idcode);

/// One queued step. Every scan ends in Run-Test/Idle.
struct Qor_Scan {
  /// An IR scan, a DR scan, or TCKs in Run-Test/Idle.
  enum class Kind { ir, dr, idle };

  Kind kind;                         ///< says which of the other members count
  unsigned device = 0;               ///< ir, dr
  unsigned userChain = 0;            ///< ir: the device selects USERn, all others BYPASS
  bool always = true;                ///< ir: must not be left out
  unsigned cycles = 0;               ///< idle: TCKs in Run-Test/Idle
  std::vector<unsigned char> out{};  ///< dr: the last bits before Update-DR; ones fill whatever comes before
  std::size_t bitCount = 0;          ///< dr
  bool capture = false;              ///< dr
  std::vector<unsigned char> in{};   ///< dr with capture: the device's first bitCount bits since Capture-DR
};

/// Asked several times a second while a cable waits for its server; true ends the wait, which throws then. For a
/// host that Ctrl-C is to end.
using StopFunction = std::function<bool()>;

/// The queue in front of a scan chain. A kind of cable says what is on the chain and how to run a queue.
class QOR_API Qor_Cable {
 public:
  /// User chains are numbered from 1 to this.
  static constexpr unsigned userChainCount = 4;

  Qor_Cable() = default;
  Qor_Cable(const Qor_Cable&) = delete;
  Qor_Cable& operator=(const Qor_Cable&) = delete;
  virtual ~Qor_Cable();

  /// What is on the chain, in device-index order. Valid as long as the cable.
  virtual const std::vector<Qor_Device>& devices() const = 0;

  /// Whether the host is to stop: whoever repeats scans for long gives up then.
  virtual bool isStopped() const { return false; }

  /// Queues: the device selects its USERn register (n = `userChain`), all others BYPASS. Unless `always` is true, as
  /// it must be after an answer that was wrong, a cable whose chain nobody else uses leaves the scan out when they do
  /// so already. Throws logic_error, queueing nothing, for a device beyond the chain or a user chain that is not 1 to 4.
  void scanIr(unsigned device, unsigned userChain, bool always = true);

  /// Queues a DR scan of `bitCount` bits of that device: `out` contains them (as many bytes as they need, else
  /// logic_error). Returns the number under which captured() gives the bits that come back, if `capture` asks
  /// for them.
  std::size_t scanDr(unsigned device, std::vector<unsigned char> out, std::size_t bitCount, bool capture);

  /// Queues TCKs in Run-Test/Idle.
  void idle(unsigned cycles);

  /// Runs the queue as one exchange; with nothing queued, does nothing. Throws on a dead link. The queue is
  /// empty afterwards in either case.
  void flush();

  /// Forgets what is queued and what was captured.
  void drop() noexcept;

  /// The bits that a scan captured; runs the queue first if it has not run. Valid until the next scan is
  /// queued. Throws as flush() does, and logic_error for a scan that captured nothing.
  const std::vector<unsigned char>& captured(std::size_t scan);

 private:
  /// Runs the steps in order and fills `in` of every scan that captures. Throws when the link fails.
  virtual void run(std::vector<Qor_Scan>& scans) = 0;

  void queue(Qor_Scan scan);
  void requireDevice(unsigned device) const;

  std::vector<Qor_Scan> scans_;
  bool ran_ = false;
};

}  // namespace QorRT
