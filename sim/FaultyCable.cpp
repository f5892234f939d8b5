#include "FaultyCable.h"

#include <algorithm>
#include <stdexcept>
#include <string>
#include <utility>

#include "sim/Bits.h"

namespace qorsim {
namespace {

using Kind = QorRT::Qor_Scan::Kind;
using BitsOfStep = Bits PassingStep::*;

/// The scan of that number, or the end.
PassingExchange::iterator scanAt(PassingExchange& exchange, std::size_t number) {
  return std::find_if(exchange.begin(), exchange.end(), [&number](const PassingStep& step) {
    return step.kind != Kind::idle && number-- == 0;
  });
}

void cutFrom(PassingExchange& exchange, PassingExchange::iterator first) {
  std::for_each(first, exchange.end(), [](PassingStep& step) { step.reachesChip = false; });
}

/// The step and the number of the bit in it; the end of the exchange when there is no such bit.
std::pair<PassingExchange::iterator, std::size_t> locate(PassingExchange& exchange, BitsOfStep bits,
                                                         BitPlace place) {
  auto step = place.scan ? scanAt(exchange, *place.scan) : exchange.begin();
  if (place.scan && step != exchange.end() && place.index >= ((*step).*bits).size()) step = exchange.end();
  while (step != exchange.end() && place.index >= ((*step).*bits).size()) {
    place.index -= ((*step).*bits).size();
    ++step;
  }
  return {step, place.index};
}

/// The bits from the place on, to the end of its scan or of the exchange.
std::vector<unsigned char*> runFrom(PassingExchange& exchange, BitsOfStep bits, BitPlace place) {
  std::vector<unsigned char*> run;
  auto [step, index] = locate(exchange, bits, place);
  while (step != exchange.end()) {
    Bits& row = (*step).*bits;
    for (; index < row.size(); ++index) run.push_back(&row[index]);
    step = place.scan ? exchange.end() : step + 1;
    index = 0;
  }
  return run;
}

void flip(const std::vector<unsigned char*>& run, unsigned pattern) {
  for (unsigned char* passing : run) {
    *passing ^= pattern & 1;
    pattern >>= 1;
  }
}

std::function<void(PassingExchange&)> editSent(BitPlace place,
                                               std::function<void(Bits&, Bits::iterator)> edit) {
  return [place, edit = std::move(edit)](PassingExchange& exchange) {
    const auto [step, index] = locate(exchange, &PassingStep::sent, place);
    if (step != exchange.end()) edit(step->sent, step->sent.begin() + static_cast<std::ptrdiff_t>(index));
  };
}

/// Ones in the place of what does not come.
Bits fitted(Bits bits, std::size_t count) {
  bits.resize(count, 1);
  return bits;
}

PassingExchange passing(const std::vector<QorRT::Qor_Scan>& scans) {
  PassingExchange exchange;
  for (const QorRT::Qor_Scan& scan : scans) {
    exchange.push_back({scan.kind});
    if (scan.kind == Kind::dr) exchange.back().sent = unpack(scan.out, scan.bitCount);
  }
  return exchange;
}

}  // namespace

Fault failAt(std::size_t scan) {
  return {[scan](PassingExchange& exchange) { cutFrom(exchange, scanAt(exchange, scan)); },
          [scan](PassingExchange& exchange, const PassingExchange&) {
            if (scanAt(exchange, scan) == exchange.end()) return;
            throw std::runtime_error("the link failed at scan " + std::to_string(scan));
          }};
}

Fault loseScan(std::size_t scan) {
  return {[scan](PassingExchange& exchange) {
    if (const auto lost = scanAt(exchange, scan); lost != exchange.end()) lost->reachesChip = false;
  }};
}

Fault silence(bool level) {
  return {[](PassingExchange& exchange) { cutFrom(exchange, exchange.begin()); },
          [level](PassingExchange& exchange, const PassingExchange&) {
            for (PassingStep& step : exchange) step.captured.assign(step.captured.size(), level);
          }};
}

Fault deliverLate() {
  return {{}, [](PassingExchange& exchange, const PassingExchange& before) {
            for (std::size_t i = 0; i < exchange.size(); ++i) {
              const Bits late = i < before.size() ? before[i].captured : Bits();
              exchange[i].captured = fitted(late, exchange[i].captured.size());
            }
          }};
}

Fault flipCaptured(BitPlace place, unsigned pattern) {
  return {{}, [=](PassingExchange& exchange, const PassingExchange&) {
            flip(runFrom(exchange, &PassingStep::captured, place), pattern);
          }};
}

Fault flipSent(BitPlace place, unsigned pattern) {
  return {[=](PassingExchange& exchange) { flip(runFrom(exchange, &PassingStep::sent, place), pattern); }};
}

Fault loseCaptured(BitPlace place) {
  return {{}, [place](PassingExchange& exchange, const PassingExchange&) {
            const auto run = runFrom(exchange, &PassingStep::captured, place);
            for (std::size_t i = 0; i < run.size(); ++i) *run[i] = i + 1 < run.size() ? *run[i + 1] : 1;
          }};
}

Fault doubleCaptured(BitPlace place) {
  return {{}, [place](PassingExchange& exchange, const PassingExchange&) {
            const auto run = runFrom(exchange, &PassingStep::captured, place);
            for (std::size_t i = run.size(); i-- > 1;) *run[i] = *run[i - 1];
          }};
}

Fault loseSent(BitPlace place) {
  return {editSent(place, [](Bits& sent, Bits::iterator lost) { sent.erase(lost); })};
}

Fault doubleSent(BitPlace place) {
  return {editSent(place, [](Bits& sent, Bits::iterator twice) { sent.insert(twice, *twice); })};
}

FaultyCable::FaultyCable(std::unique_ptr<QorRT::Qor_Cable> whole) : whole_(std::move(whole)) {}

FaultyCable& FaultyCable::next(Fault fault) {
  script_.push_back(std::move(fault));
  return *this;
}

Fault FaultyCable::takeFault() {
  if (script_.empty()) return {};
  Fault fault = std::move(script_.front());
  script_.pop_front();
  return fault;
}

void FaultyCable::run(std::vector<QorRT::Qor_Scan>& scans) {
  if (isDown_) throw std::runtime_error("the link is down");
  const Fault fault = takeFault();
  PassingExchange exchange = passing(scans);
  if (fault.out) fault.out(exchange);
  pass(scans, exchange);
  const PassingExchange before = std::exchange(before_, exchange);
  if (fault.back) fault.back(exchange, before);
  for (std::size_t i = 0; i < scans.size(); ++i)
    if (scans[i].capture) scans[i].in = pack(exchange[i].captured);
}

void FaultyCable::pass(const std::vector<QorRT::Qor_Scan>& scans, PassingExchange& exchange) {
  whole_->drop();  // an exchange that broke off while it was queued
  std::vector<std::size_t> numbers(scans.size());
  for (std::size_t i = 0; i < scans.size(); ++i) {
    const QorRT::Qor_Scan& scan = scans[i];
    const Bits& sent = exchange[i].sent;
    if (!exchange[i].reachesChip) continue;
    if (scan.kind == Kind::ir) whole_->scanIr(scan.device, scan.userChain, scan.always);
    if (scan.kind == Kind::dr)
      numbers[i] = whole_->scanDr(scan.device, pack(sent), sent.size(), scan.capture);
    if (scan.kind == Kind::idle) whole_->idle(scan.cycles);
  }
  whole_->flush();
  for (std::size_t i = 0; i < scans.size(); ++i) {
    if (!scans[i].capture) continue;
    Bits& captured = exchange[i].captured;
    if (exchange[i].reachesChip) captured = unpack(whole_->captured(numbers[i]), exchange[i].sent.size());
    captured.resize(scans[i].bitCount, 1);
  }
}

}  // namespace qorsim
