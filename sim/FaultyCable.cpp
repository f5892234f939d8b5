#include "FaultyCable.h"

#include <algorithm>
#include <stdexcept>
#include <string>
#include <utility>

#include "sim/Bits.h"

namespace qorsim {
namespace {

using Kind = QorRT::Qor_Scan::Kind;
using Step = PassingExchange::iterator;

/// The scan of that number, or the end.
Step scanAt(PassingExchange& exchange, std::size_t number) {
  return std::find_if(exchange.begin(), exchange.end(), [&number](const PassingStep& step) {
    return step.kind != Kind::idle && number-- == 0;
  });
}

/// The step of a sent bit and the bit; the end of the exchange when there is no such bit.
std::pair<Step, Bits::iterator> sentBit(PassingExchange& exchange, std::size_t bit) {
  auto step = exchange.begin();
  for (; step != exchange.end() && bit >= step->sent.size(); ++step) bit -= step->sent.size();
  if (step == exchange.end()) return {step, {}};
  return {step, step->sent.begin() + static_cast<std::ptrdiff_t>(bit)};
}

/// The bits from that one on, to the end of the exchange.
std::vector<unsigned char*> runFrom(PassingExchange& exchange, Bits PassingStep::*bits, std::size_t bit) {
  std::vector<unsigned char*> run;
  for (PassingStep& step : exchange)
    for (unsigned char& each : step.*bits) run.push_back(&each);
  run.erase(run.begin(), run.begin() + static_cast<std::ptrdiff_t>(std::min(bit, run.size())));
  return run;
}

void flip(const std::vector<unsigned char*>& run, unsigned pattern) {
  for (unsigned char* passing : run) {
    *passing ^= pattern & 1;
    pattern >>= 1;
  }
}

std::function<void(PassingExchange&)> editSent(std::size_t bit,
                                               std::function<void(Bits&, Bits::iterator)> edit) {
  return [bit, edit = std::move(edit)](PassingExchange& exchange) {
    if (const auto [step, place] = sentBit(exchange, bit); step != exchange.end()) edit(step->sent, place);
  };
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
  return {[scan](PassingExchange& exchange) {
    const auto failed = scanAt(exchange, scan);
    if (failed == exchange.end()) return;
    failed->reachesChip = false;
    failed->failure = "the link failed at scan " + std::to_string(scan);
  }};
}

Fault cutAt(std::size_t bit) {
  return {[bit](PassingExchange& exchange) {
    const auto [step, place] = sentBit(exchange, bit);
    if (step == exchange.end()) return;
    step->sent.erase(place, step->sent.end());
    step->reachesChip = !step->sent.empty();
    step->failure = "the link failed at bit " + std::to_string(bit);
  }};
}

Fault loseScan(std::size_t scan) {
  return {[scan](PassingExchange& exchange) {
    if (const auto lost = scanAt(exchange, scan); lost != exchange.end()) lost->reachesChip = false;
  }};
}

Fault interrupt(std::size_t scan, std::function<void()> others) {
  return {[scan, others = std::move(others)](PassingExchange& exchange) {
    if (const auto next = scanAt(exchange, scan); next != exchange.end()) next->before = others;
  }};
}

Fault silence(bool level) {
  return {[](PassingExchange& exchange) {
            for (PassingStep& step : exchange) step.reachesChip = false;
          },
          [level](PassingExchange& exchange, const PassingExchange&) {
            for (PassingStep& step : exchange) step.captured.assign(step.captured.size(), level);
          }};
}

Fault deliverLate() {
  return {{}, [](PassingExchange& exchange, const PassingExchange& before) {
            for (std::size_t i = 0; i < exchange.size(); ++i) {
              const std::size_t count = exchange[i].captured.size();
              exchange[i].captured = i < before.size() ? before[i].captured : Bits();
              exchange[i].captured.resize(count, 1);
            }
          }};
}

Fault flipCaptured(std::size_t bit, unsigned pattern) {
  return {{}, [=](PassingExchange& exchange, const PassingExchange&) {
            flip(runFrom(exchange, &PassingStep::captured, bit), pattern);
          }};
}

Fault flipSent(std::size_t bit, unsigned pattern) {
  return {[=](PassingExchange& exchange) { flip(runFrom(exchange, &PassingStep::sent, bit), pattern); }};
}

Fault loseCaptured(std::size_t bit) {
  return {{}, [bit](PassingExchange& exchange, const PassingExchange&) {
            const auto run = runFrom(exchange, &PassingStep::captured, bit);
            for (std::size_t i = 0; i < run.size(); ++i) *run[i] = i + 1 < run.size() ? *run[i + 1] : 1;
          }};
}

Fault doubleCaptured(std::size_t bit) {
  return {{}, [bit](PassingExchange& exchange, const PassingExchange&) {
            const auto run = runFrom(exchange, &PassingStep::captured, bit);
            for (std::size_t i = run.size(); i-- > 1;) *run[i] = *run[i - 1];
          }};
}

Fault loseSent(std::size_t bit) {
  return {editSent(bit, [](Bits& sent, Bits::iterator lost) { sent.erase(lost); })};
}

Fault doubleSent(std::size_t bit) {
  return {editSent(bit, [](Bits& sent, Bits::iterator twice) { sent.insert(twice, *twice); })};
}

FaultyCable::FaultyCable(std::shared_ptr<QorRT::Qor_Cable> chain) : chain_(std::move(chain)) {}

FaultyCable& FaultyCable::next(Fault fault) {
  script_.push_back(std::move(fault));
  return *this;
}

FaultyCable& FaultyCable::noise(double sent, double captured, unsigned seed) {
  sentNoise_ = sent;
  capturedNoise_ = captured;
  random_.seed(seed);
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
  chain_->drop();  // an exchange that broke off while it was queued
  for (std::size_t i = 0; i < scans.size(); ++i) {
    if (exchange[i].before) {
      chain_->flush();
      exchange[i].before();
    }
    if (exchange[i].reachesChip) passStep(scans[i], exchange[i]);
    if (!exchange[i].failure.empty()) fail(exchange[i].failure);
    if (scans[i].capture) exchange[i].captured.resize(scans[i].bitCount, 1);
  }
  chain_->flush();
}

void FaultyCable::passStep(const QorRT::Qor_Scan& scan, PassingStep& step) {
  if (scan.kind == Kind::ir) chain_->scanIr(scan.device, scan.userChain, scan.always);
  if (scan.kind == Kind::idle) chain_->idle(scan.cycles);
  if (scan.kind != Kind::dr) return;
  disturb(step.sent, sentNoise_);
  const std::size_t number = chain_->scanDr(scan.device, pack(step.sent), step.sent.size(), scan.capture);
  if (!scan.capture) return;
  step.captured = unpack(chain_->captured(number), step.sent.size());
  disturb(step.captured, capturedNoise_);
}

void FaultyCable::fail(const std::string& failure) {
  chain_->flush();
  throw std::runtime_error(failure);
}

void FaultyCable::disturb(std::vector<unsigned char>& bits, double rate) {
  if (rate <= 0) return;
  std::geometric_distribution<std::size_t> gap(rate);
  for (std::size_t i = gap(random_); i < bits.size(); i += gap(random_) + 1, ++noisyBits_) bits[i] ^= 1;
}

}  // namespace qorsim
