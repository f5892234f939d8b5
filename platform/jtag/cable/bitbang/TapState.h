// The state machine of a TAP, as the standard draws it: pure functions, for cables that drive TMS themselves.
#pragma once

namespace QorRT {

enum class TapState {
  testLogicReset,
  runTestIdle,
  selectDrScan,
  captureDr,
  shiftDr,
  exit1Dr,
  pauseDr,
  exit2Dr,
  updateDr,
  selectIrScan,
  captureIr,
  shiftIr,
  exit1Ir,
  pauseIr,
  exit2Ir,
  updateIr,
};

constexpr unsigned tapStateCount = 16;

/// TMS values, bit 0 first.
struct TmsPath {
  unsigned bits;
  unsigned count;
};

/// So many TCKs with TMS 1 lead into Test-Logic-Reset from anywhere.
constexpr TmsPath tmsReset{0x1F, 5};

/// The state after one TCK.
TapState nextState(TapState state, bool tms);

/// The shortest way from one state to another; none from a state to itself.
TmsPath tmsPath(TapState from, TapState to);

}  // namespace QorRT
