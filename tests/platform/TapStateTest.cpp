// The TAP state machine and the walks through it, against the wording of the standard's diagram.
#include <gtest/gtest.h>

#include <string>

#include "platform/jtag/cable/bitbang/TapState.h"
#include "platform/jtag/cable/bitbang/TckSequence.h"

namespace {

using QorRT::nextState;
using QorRT::TapState;
using QorRT::TckSequence;
using QorRT::tmsPath;

constexpr unsigned states = QorRT::tapStateCount;

TapState walk(TapState state, QorRT::TmsPath path) {
  for (unsigned i = 0; i < path.count; ++i) state = nextState(state, (path.bits >> i & 1) != 0);
  return state;
}

// The lengths of all shortest walks, by relaxing them one by one until nothing gets shorter.
struct Distances {
  Distances() {
    for (unsigned from = 0; from < states; ++from)
      for (unsigned to = 0; to < states; ++to) length[from][to] = from == to ? 0 : 99;
    for (unsigned round = 0; round < states; ++round) {
      for (unsigned from = 0; from < states; ++from)
        for (const bool tms : {false, true})
          relax(from, static_cast<unsigned>(nextState(TapState(from), tms)));
    }
  }
  void relax(unsigned from, unsigned by) {
    for (unsigned to = 0; to < states; ++to)
      length[from][to] = std::min(length[from][to], length[by][to] + 1);
  }
  unsigned length[states][states] = {};
};

TEST(TapStates, AreReachedFromEachOtherByTheShortestWalk) {
  const Distances shortest;
  for (unsigned from = 0; from < states; ++from) {
    EXPECT_EQ(walk(TapState(from), QorRT::tmsReset), TapState::testLogicReset) << from;
    for (unsigned to = 0; to < states; ++to) {
      const QorRT::TmsPath path = tmsPath(TapState(from), TapState(to));
      EXPECT_EQ(walk(TapState(from), path), TapState(to)) << from << " to " << to;
      EXPECT_EQ(path.count, shortest.length[from][to]) << from << " to " << to;
    }
  }
}

// One letter a TCK: TMS, and TDI in the Shift states; a capture is marked.
std::string letters(const TckSequence& sequence) {
  std::string text;
  for (const unsigned char tck : sequence.tcks()) {
    text += (tck & TckSequence::tms) != 0 ? '1' : '0';
    if ((tck & TckSequence::tdi) == 0) text += 'l';
    if ((tck & TckSequence::capture) != 0) text += '?';
  }
  return text;
}

TEST(TckSequences, WalkRoundTheDiagramAndShiftWithTheLastTckOfShift) {
  TckSequence sequence;
  sequence.reset();
  EXPECT_EQ(letters(sequence), "111110");
  TckSequence scans;
  scans.scanIr({{0x01}, 2});        // select, select, capture, shift; bits; update, idle
  scans.scanDr({{0x05}, 3}, true);  // select, capture, shift; bits; update, idle
  scans.idle(2);
  EXPECT_EQ(letters(scans),
            "110001l10"
            "1000?0l?1?10"
            "00");
  EXPECT_EQ(scans.captureCount(), 3U);
  TckSequence empty;
  empty.scanDr({{}, 0}, true);  // select, capture, exit, update, idle
  EXPECT_EQ(letters(empty), "10110");
}

}  // namespace
