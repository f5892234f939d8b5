// The demo board, whatever it is made of and whatever leads to it. It keeps its state between tests.
#include <array>

#include "tests/system/Board.h"

namespace {

constexpr QOR_CORE_REF first{0, 1, 0}, counting{1, 1, 0};

TEST(DemoBoard, TellsWhatStandsOnIt) {
  Board board(demoUrl());
  const std::pair<QOR_CORE_REF, unsigned> cores[] = {{{0, 1, 0}, 1}, {{0, 1, 1}, 0}, {{1, 1, 0}, 1}};
  unsigned result = 99;
  for (auto [ref, isVio] : cores) {
    EXPECT_EQ(QorVIO_isVIOCore(board.session, ref, &result), 0U);
    EXPECT_EQ(result, isVio);
  }
  EXPECT_NE(QorVIO_isVIOCore(board.session, {0, 1, 15}, &result),
            0U);  // the hub says so: no failure of the link
  EXPECT_EQ(result, 0U);
  EXPECT_TRUE(board.takeMessages().empty());
}

TEST(DemoBoard, ReportsThatAnAddressHasNoCoreAndGoesOn) {
  Board board(demoUrl());
  EXPECT_EQ(QorVIO_initCore(board.session, {0, 2, 0}), failed);
  EXPECT_THAT(
      board.takeMessages(),
      ElementsAre(
          "100 device 0, user chain 2, core 0: no debug hub answers, TDO is all zeros, in 4 attempts"));
  for (const QOR_CORE_REF ref : {QOR_CORE_REF{0, 1, 1}, {0, 1, 9}}) {
    EXPECT_EQ(QorVIO_initCore(board.session, ref), failed);
    EXPECT_THAT(board.takeMessages(),
                ElementsAre("100 QorVIO_initCore() for the wrong core type or non-existant core.",
                            "8000 Qor abort command"));
  }
}

TEST(DemoBoard, BringsBackWhatItIsGivenWithItsActivityOnce) {
  Board board(demoUrl());
  VioCore core(board, first);
  core.define("bus", asyncOut, {7, 3, 5, 0});
  core.define("bus", asyncIn, {7, 3, 5, 0});
  core.write({{"async_out_data", "00"}, {"sync_out_data", "0F"}});
  core.read();
  core.write({{"bus", "9"}, {"sync_out_data", "3C"}});
  TextMap values = core.read();
  EXPECT_EQ(values["bus"], "9");
  EXPECT_EQ(values["async_in_data"], "81");
  EXPECT_EQ(values["async_in_data.activity_up"], "81");
  EXPECT_EQ(values["sync_in_data"], "3C");
  EXPECT_EQ(values["sync_in_data.activity_down"], "03");
  EXPECT_EQ(values["sync_in_data.sync_activity_up"], "30");
  core.write({{"bus", "4"}});
  values = core.read();
  EXPECT_EQ(values["async_in_data"], "20");
  EXPECT_EQ(values["bus.activity_up"], "4");
  EXPECT_EQ(values["bus.activity_down"], "9");
  values = core.read();
  EXPECT_EQ(values["bus.activity_up"], "0");
  EXPECT_EQ(values["bus.activity_down"], "0");
}

TEST(DemoBoard, PlaysPulseTrainsWhoseStepsShowAsActivity) {
  Board board(demoUrl());
  VioCore core(board, first);
  core.write({{"sync_out_data", "80"}});
  core.read();
  core.define("pulse", syncOut, {2});
  core.write({{"pulse.pulsetrain", "00000000000000000000000000000100"}});  // 1 at step 1 alone
  core.read();
  TextMap values = core.read();  // the write has played it to its end
  EXPECT_EQ(values["sync_in_data"], "80");
  core.write({{"pulse.pulsetrain", "01000000000000000000000000000100"}});  // 1 at step 1, and from step 15 on
  core.read();
  core.write({});
  values = core.read();
  EXPECT_EQ(values["sync_in_data"], "84");
  EXPECT_EQ(values["sync_in_data.activity_down"], "00");
}

TEST(DemoBoard, MovesWholePortsUnderTheirMasks) {
  Board board(demoUrl());
  VioCore core(board, first);
  core.write({{"async_out_data", "F0"}, {"sync_out_data", "F0"}});
  unsigned char value = 0x3A, mask = 0x0F, async = 0, sync = 0, rose = 0, fell = 0;
  unsigned char* none = nullptr;
  std::array<unsigned char, 16> steps{};
  steps.back() = 0x3A;
  QorVIO_getPortBits(board.session, first, &async, none, none, 8, none, none, none, none, none, 0);
  EXPECT_EQ(QorVIO_setPortBits(board.session, first, &value, &mask, 8, steps.data(), &mask, 8), 0U);
  EXPECT_EQ(QorVIO_getPortBits(board.session, first, none, none, none, 0, &sync, none, none, none, none, 8),
            0U);
  EXPECT_EQ(
      QorVIO_getPortBits(board.session, first, &async, &rose, &fell, 8, &sync, none, none, none, none, 8),
      0U);
  EXPECT_EQ(async, 0xFA);
  EXPECT_EQ(sync, 0xFA);
}

TEST(DemoBoard, CountsItsClocksBehindItsSecondDevice) {
  Board board(demoUrl());
  VioCore core(board, counting);
  core.read();
  const TextMap before = core.read(), after = core.read();
  EXPECT_NE(before.at("sync_in_data"), after.at("sync_in_data"));
  EXPECT_EQ(after.at("async_in_data"), after.at("sync_in_data"));
  for (const char* flag : {"sync_in_data.sync_activity_up", "sync_in_data.sync_activity_down"})
    EXPECT_EQ(std::stoul(after.at(flag), nullptr, 16) & 3, 3U) << flag;  // a read leaves it some clocks
}

}  // namespace
