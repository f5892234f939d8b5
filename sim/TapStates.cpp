#include "sim/TapStates.h"

#include <array>
#include <cstddef>

namespace qorsim {
namespace {

struct Ways {
  TapState low, high;  // with TMS 0 and 1
};

// In the order of the states.
constexpr std::array<Ways, 16> ways{{
    {TapState::runTestIdle, TapState::testLogicReset},
    {TapState::runTestIdle, TapState::selectDr},
    {TapState::captureDr, TapState::selectIr},
    {TapState::shiftDr, TapState::exit1Dr},
    {TapState::shiftDr, TapState::exit1Dr},
    {TapState::pauseDr, TapState::updateDr},
    {TapState::pauseDr, TapState::exit2Dr},
    {TapState::shiftDr, TapState::updateDr},
    {TapState::runTestIdle, TapState::selectDr},
    {TapState::captureIr, TapState::testLogicReset},
    {TapState::shiftIr, TapState::exit1Ir},
    {TapState::shiftIr, TapState::exit1Ir},
    {TapState::pauseIr, TapState::updateIr},
    {TapState::pauseIr, TapState::exit2Ir},
    {TapState::shiftIr, TapState::updateIr},
    {TapState::runTestIdle, TapState::selectDr},
}};

}  // namespace

TapState nextState(TapState state, bool tms) {
  const Ways& from = ways[static_cast<std::size_t>(state)];
  return tms ? from.high : from.low;
}

}  // namespace qorsim
