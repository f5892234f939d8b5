// The sixteen states of a TAP controller.
#pragma once

namespace qorsim {

enum class TapState {
  testLogicReset,
  runTestIdle,
  selectDr,
  captureDr,
  shiftDr,
  exit1Dr,
  pauseDr,
  exit2Dr,
  updateDr,
  selectIr,
  captureIr,
  shiftIr,
  exit1Ir,
  pauseIr,
  exit2Ir,
  updateIr,
};

/// The state after a rising TCK.
TapState nextState(TapState state, bool tms);

}  // namespace qorsim
