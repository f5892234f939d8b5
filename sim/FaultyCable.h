/// @file
/// A link that fails by a script, to try what hosts and tools make of it:
///
///     auto cable = std::make_unique<qorsim::FaultyCable>(qorsim::demoBoard().cable());
///     cable->next(qorsim::flipCaptured(qorsim::bit(17)))   // the next exchange
///         .next(qorsim::failAt(2));                        // the one after it
///
/// Conventions
///
///  1. A fault lasts for one exchange, which stays one exchange; those without a fault pass as they are.
///  2. Scans are the IR and DR scans of an exchange, counted from 0; TCKs in Run-Test/Idle are no scan. A
///     fault of a scan that the exchange does not have changes nothing.
///  3. Sent bits are those of its DR scans, captured bits those of its DR scans that capture, scan after
///     scan, counted from 0. A fault of a bit that there is not changes nothing.
///  4. A line that nobody drives reads as 1.
#pragma once

#include <cstddef>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <vector>

#include "Qor_Cable.h"

namespace qorsim {

/// A step of an exchange on its way. Bits are one element (0 or 1) each, in the order of the wire.
struct PassingStep {
  QorRT::Qor_Scan::Kind kind;             ///< as the host queued it
  bool reachesChip = true;                ///< false: the chip does not see it
  std::vector<unsigned char> sent{};      ///< may be made longer or shorter: the chip then sees so many TCKs
  std::vector<unsigned char> captured{};  ///< on the way back only, always as many as the host asked for
};
/// An exchange on its way, in the order of its steps.
using PassingExchange = std::vector<PassingStep>;

/// What happens to one exchange; either part may be empty. Faults other than those below can be made of it.
struct Fault {
  /// Changes what is on its way to the chip.
  std::function<void(PassingExchange& exchange)> out{};

  /// Changes what is on its way back, or throws: then nothing comes back. `before` is what the chip delivered
  /// in the exchange before; it is empty at first.
  std::function<void(PassingExchange& exchange, const PassingExchange& before)> back{};
};

/// A bit of an exchange, or of one of its scans.
struct BitPlace {
  std::size_t index = 0;              ///< from the beginning of the exchange, or of the scan
  std::optional<std::size_t> scan{};  ///< none: counted through the exchange

  /// Counts the bit from the beginning of that scan, and keeps the fault within the scan.
  BitPlace ofScan(std::size_t number) const { return {index, number}; }
};

/// Counts the bit from the beginning of the exchange.
inline BitPlace bit(std::size_t index) {
  return {index, {}};
}

/// Throws runtime_error "the link failed at scan SCAN" in the place of that scan; the chip saw those before.
QOR_API Fault failAt(std::size_t scan);

/// The chip does not see the scan.
QOR_API Fault loseScan(std::size_t scan);

/// The chip sees nothing, and every captured bit is `level`.
QOR_API Fault silence(bool level);

/// The host gets what the chip delivered in the exchange before, and the chip sees this one. Nothing in the
/// bits tells a late answer to an exchange just like this one from the right answer.
QOR_API Fault deliverLate();

/// Inverts the bits that `pattern` has set, its bit 0 at the place.
/// @{
QOR_API Fault flipCaptured(BitPlace place, unsigned pattern = 1);
QOR_API Fault flipSent(BitPlace place, unsigned pattern = 1);
/// @}

/// The captured bit is lost: those behind it move up.
QOR_API Fault loseCaptured(BitPlace place);

/// The captured bit comes twice: those behind it move down, and the last one is lost.
QOR_API Fault doubleCaptured(BitPlace place);

/// The chip misses the TCK of the bit: its scan is one bit shorter.
QOR_API Fault loseSent(BitPlace place);

/// The chip takes one TCK for two: its scan is one bit longer.
QOR_API Fault doubleSent(BitPlace place);

/// A cable with such a link to the chain of another cable.
class QOR_API FaultyCable : public QorRT::Qor_Cable {
 public:
  /// Owns the whole cable from then on.
  explicit FaultyCable(std::unique_ptr<QorRT::Qor_Cable> whole);

  const std::vector<QorRT::Qor_Device>& devices() const override { return whole_->devices(); }

  /// Appends to the script; a fault without parts lets an exchange pass.
  FaultyCable& next(Fault fault);

  /// Until restore(), every exchange throws runtime_error "the link is down", and the chip sees nothing. The
  /// script waits.
  /// @{
  void drop() { isDown_ = true; }
  void restore() { isDown_ = false; }
  /// @}

 private:
  void run(std::vector<QorRT::Qor_Scan>& scans) override;
  Fault takeFault();
  void pass(const std::vector<QorRT::Qor_Scan>& scans, PassingExchange& exchange);

  std::unique_ptr<QorRT::Qor_Cable> whole_;
  std::deque<Fault> script_;
  PassingExchange before_;
  bool isDown_ = false;
};

}  // namespace qorsim
