#include "SimPins.h"

#include <utility>

#include "sim/Chain.h"
#include "sim/TapStates.h"

namespace qorsim {

SimPins::SimPins(std::unique_ptr<Chain> chain) : chain_(std::move(chain)), state_(TapState::testLogicReset) {}

SimPins::~SimPins() = default;

void SimPins::write(bool tck, bool tms, bool tdi) {
  if (tck == tck_) return;
  tck_ = tck;
  if (tck)
    rise(tms, tdi);
  else
    fall();
}

void SimPins::setTrst(bool asserted) {
  trst_ = asserted;
  if (!asserted) return;
  state_ = TapState::testLogicReset;
  chain_->reset();
  tdo_ = true;
}

// What a state does when it is left, or entered once more.
void SimPins::rise(bool tms, bool tdi) {
  switch (state_) {
    case TapState::captureDr:
      chain_->captureDr();
      break;
    case TapState::captureIr:
      chain_->captureIr();
      break;
    case TapState::shiftDr:
    case TapState::shiftIr:
      chain_->shift(tdi);
      break;
    default:
      chain_->settle();
      if (state_ == TapState::runTestIdle && !tms) chain_->idle(1);
      break;
  }
  if (!trst_) state_ = nextState(state_, tms);
}

// What a state does half a TCK after it was entered.
void SimPins::fall() {
  if (state_ == TapState::testLogicReset) chain_->reset();
  if (state_ == TapState::updateIr) chain_->updateIr();
  const bool shifting = state_ == TapState::shiftDr || state_ == TapState::shiftIr;
  tdo_ = !shifting || chain_->out();
}

}  // namespace qorsim
