/// @file
/// A link that fails by a script, to try what hosts and tools make of it:
///
///     auto cable = std::make_unique<qorsim::FaultyCable>(qorsim::demoBoard().cable());
///     cable->next(qorsim::flipCaptured(17))   // the next exchange
///         .next(qorsim::failAt(1));           // the one after it
///
/// Conventions
///
///  1. A fault lasts for one exchange; exchanges without a fault pass as they are.
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
#include <random>
#include <string>
#include <vector>

#include "Qor_Cable.h"

namespace qorsim {

/// A step of an exchange on its way. Bits are one element (0 or 1) each, in the order of the wire.
struct PassingStep {
  QorRT::Qor_Scan::Kind kind;             ///< as the host queued it
  bool reachesChip = true;                ///< false: the chip does not see it
  std::function<void()> before{};         ///< what other software does just before it, unless empty
  std::string failure{};                  ///< unless empty: the link fails after it, with this text
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

/// Throws runtime_error "the link failed at scan SCAN" in the place of that scan; the chip saw those before.
QOR_API Fault failAt(std::size_t scan);

/// Throws runtime_error "the link failed at bit BIT" in the place of that sent bit; the scan ends before it.
QOR_API Fault cutAt(std::size_t bit);

/// The chip does not see the scan.
QOR_API Fault loseScan(std::size_t scan);

/// Other software has the chain just before the scan. It may use another FaultyCable to the same chain.
QOR_API Fault interrupt(std::size_t scan, std::function<void()> others);

/// The chip sees nothing, and every captured bit is `level`.
QOR_API Fault silence(bool level);

/// The host gets what the chip delivered in the exchange before, and the chip sees this one.
QOR_API Fault deliverLate();

/// Inverts the bits that `pattern` has set, its bit 0 at the place.
/// @{
QOR_API Fault flipCaptured(std::size_t bit, unsigned pattern = 1);
QOR_API Fault flipSent(std::size_t bit, unsigned pattern = 1);
/// @}

/// The captured bit is lost: those after it move up.
QOR_API Fault loseCaptured(std::size_t bit);

/// The captured bit comes twice: those after it move down, and the last one is lost.
QOR_API Fault doubleCaptured(std::size_t bit);

/// The chip misses the TCK of the bit: its scan is one bit shorter.
QOR_API Fault loseSent(std::size_t bit);

/// The chip takes one TCK for two: its scan is one bit longer.
QOR_API Fault doubleSent(std::size_t bit);

/// A cable with such a link to the chain of another cable.
class QOR_API FaultyCable : public QorRT::Qor_Cable {
 public:
  /// Several of them may share the chain, as several programs do, in one thread.
  explicit FaultyCable(std::shared_ptr<QorRT::Qor_Cable> chain);

  const std::vector<QorRT::Qor_Device>& devices() const override { return chain_->devices(); }

  /// Appends to the script; a fault without parts lets an exchange pass.
  FaultyCable& next(Fault fault);

  /// From now on each bit sent and each bit captured is inverted with this probability, beside the script.
  FaultyCable& noise(double sent, double captured, unsigned seed = 1);

  /// How many bits noise has inverted.
  std::size_t noisyBits() const { return noisyBits_; }

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
  void passStep(const QorRT::Qor_Scan& scan, PassingStep& step);
  void fail(const std::string& failure);
  void disturb(std::vector<unsigned char>& bits, double rate);

  std::shared_ptr<QorRT::Qor_Cable> chain_;
  std::deque<Fault> script_;
  PassingExchange before_;
  bool isDown_ = false;

  double sentNoise_ = 0, capturedNoise_ = 0;
  std::mt19937_64 random_;
  std::size_t noisyBits_ = 0;
};

}  // namespace qorsim
