// The whole library on simulated boards: finding cores, values out and in, pulse trains.
#include <numeric>

#include "tests/system/Board.h"

namespace {

using qorsim::chain;
using qorsim::loopback;
using qorsim::vio;

TEST(Names, GoOutThroughTheDesignAndBackWithTheirActivityInOneExchangeEach) {
  auto cable = chain()
                   .device(0x11)
                   .core(2, 5, vio().asyncOut(12).asyncIn(12).syncOut(4).syncIn(4).design(loopback()))
                   .device()
                   .cable();
  const qorsim::SimCable& counted = *cable;
  Board board(std::move(cable));
  VioCore core(board, {0, 2, 5});
  core.define("bus", asyncOut, {11, 3, 7, 0});
  core.define("bus", asyncIn, {11, 3, 7, 0});
  core.define("nibble", syncOut, {3, 2, 1, 0});
  core.define("nibble", syncIn, {3, 2, 1, 0});
  core.write({});  // the first of a session has one exchange more
  const auto before = counted.exchanges();
  core.write({{"bus", "9"}, {"nibble", "6"}});
  EXPECT_EQ(counted.exchanges() - before, 1U);
  TextMap values = core.read();
  EXPECT_EQ(counted.exchanges() - before, 2U);
  EXPECT_EQ(values["bus"], "9");
  EXPECT_EQ(values["async_in_data"], "801");
  EXPECT_EQ(values["nibble.sync_activity_up"], "6");
  core.write({{"BUS", "4"}});
  values = core.read();
  EXPECT_EQ(values["bus.activity_up"], "4");
  EXPECT_EQ(values["bus.activity_down"], "9");
  EXPECT_EQ(values["nibble"], "6");
  EXPECT_EQ(values["nibble.activity_up"], "0");
}

TEST(PulseTrains, PlayStepByStepAndHoldTheLastStep) {
  std::string seen;  // bit 0 of the synchronous outputs, clock by clock
  auto watch = [&](qorsim::Ports& ports) { seen += static_cast<char>('0' + ports.syncOut[0]); };
  Board board(
      chain().device(0x11).core(1, 0, vio().syncOut(2).syncIn(1).design(qorsim::callback(watch))).cable());
  VioCore core(board, {0, 1, 0});
  core.define("pulse", syncOut, {0});
  core.define("other", syncOut, {1});
  seen.clear();
  core.write({{"pulse.pulsetrain", "01000100000100000001000100010000"}});
  core.read();
  EXPECT_THAT(seen, testing::MatchesRegex("0*00101010001001011+"));  // step 0 is the rightmost byte
  seen.clear();
  core.write({{"other", "1"}});
  EXPECT_THAT(seen, testing::MatchesRegex("1+"));
}

TEST(WholePorts, GoRoundUnderTheirMaskAtEveryWidthAndPlaceOnTheChain) {
  for (auto [width, place] : {std::pair{1U, 0U}, {7U, 2U}, {8U, 0U}, {33U, 2U}, {4096U, 0U}, {65535U, 2U}}) {
    auto builder = chain();
    for (unsigned device = 0; device < place; ++device) builder.device(device).irLength(4 + device);
    builder.device(0x11).core(
        3, 9, vio().asyncOut(width).asyncIn(width).syncOut(width).syncIn(width).design(loopback()));
    builder.device().irLength(11);
    Board board(builder.cable());
    const QOR_CORE_REF ref{place, 3, 9};
    VioCore core(board, ref);
    const std::size_t bytes = (width + 7) / 8;
    Bytes values(bytes), steps(16 * bytes), mask(bytes, 0xFD), async(bytes), rose(bytes), sync(bytes);
    std::iota(values.begin(), values.end(), static_cast<unsigned char>(0x37));
    std::iota(steps.begin(), steps.end(), static_cast<unsigned char>(0x9E));
    unsigned char* none = nullptr;
    EXPECT_EQ(QorVIO_setPortBits(board.session, ref, values.data(), mask.data(), width, steps.data(),
                                 mask.data(), width),
              0U);
    EXPECT_EQ(QorVIO_getPortBits(board.session, ref, async.data(), rose.data(), none, width, sync.data(),
                                 none, none, none, none, width),
              0U);
    mask.back() &= static_cast<unsigned char>(0xFF >> (8 * bytes - width));
    for (std::size_t i = 0; i < bytes; ++i) {
      ASSERT_EQ(async[i], values[i] & mask[i]) << width << " bits, byte " << i;
      ASSERT_EQ(rose[i], async[i]) << width << " bits, byte " << i;
      ASSERT_EQ(sync[i], steps[15 * bytes + i] & mask[i]) << width << " bits, byte " << i;
    }
  }
}

}  // namespace
