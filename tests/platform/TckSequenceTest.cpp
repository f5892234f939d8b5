// The walks through the states of a TAP, against the standard's diagram.
#include "platform/jtag/cable/bitbang/TckSequence.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using QorRT::TckSequence;

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
