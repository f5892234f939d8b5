#include "platform/jtag/cable/bitbang/TapState.h"

#include <array>

namespace QorRT {
namespace {

using S = TapState;

struct Successors {
  TapState onZero;
  TapState onOne;
};

constexpr std::array<Successors, tapStateCount> successors{{
    {S::runTestIdle, S::testLogicReset},  // testLogicReset
    {S::runTestIdle, S::selectDrScan},    // runTestIdle
    {S::captureDr, S::selectIrScan},      // selectDrScan
    {S::shiftDr, S::exit1Dr},             // captureDr
    {S::shiftDr, S::exit1Dr},             // shiftDr
    {S::pauseDr, S::updateDr},            // exit1Dr
    {S::pauseDr, S::exit2Dr},             // pauseDr
    {S::shiftDr, S::updateDr},            // exit2Dr
    {S::runTestIdle, S::selectDrScan},    // updateDr
    {S::captureIr, S::testLogicReset},    // selectIrScan
    {S::shiftIr, S::exit1Ir},             // captureIr
    {S::shiftIr, S::exit1Ir},             // shiftIr
    {S::pauseIr, S::updateIr},            // exit1Ir
    {S::pauseIr, S::exit2Ir},             // pauseIr
    {S::shiftIr, S::updateIr},            // exit2Ir
    {S::runTestIdle, S::selectDrScan},    // updateIr
}};

// Where a walk has come to, and how.
struct Step {
  TapState state;
  TmsPath path;
};

}  // namespace

TapState nextState(TapState state, bool tms) {
  const Successors& after = successors[static_cast<unsigned>(state)];
  return tms ? after.onOne : after.onZero;
}

// Breadth first: the queue holds each state once, in the order in which a walk can reach them.
TmsPath tmsPath(TapState from, TapState to) {
  std::array<Step, tapStateCount> queue{};
  queue[0] = {from, {0, 0}};
  unsigned reached = 1, seen = 1u << static_cast<unsigned>(from);
  for (const Step& here : queue) {
    if (here.state == to) return here.path;
    for (const unsigned tms : {0u, 1u}) {
      const TapState next = nextState(here.state, tms != 0);
      if ((seen >> static_cast<unsigned>(next) & 1) != 0) continue;
      seen |= 1u << static_cast<unsigned>(next);
      queue[reached++] = {next, {here.path.bits | tms << here.path.count, here.path.count + 1}};
    }
  }
  return tmsReset;  // never reached: every state leads to every other
}

}  // namespace QorRT
