// The whole library on simulated boards: finding cores, values out and in, pulse trains, samples.
#include <numeric>

#include "Board.h"

namespace {

using qorsim::chain;
using qorsim::loopback;
using qorsim::vio;

constexpr QOR_CORE_REF first{0, 1, 0};

TEST(DemoBoard, TellsWhatStandsOnIt) {
  Board board("sim:");
  std::vector<QorRT::Qor_Device> devices;
  QorJtag_session_getDevices(board.session, devices);
  ASSERT_EQ(devices.size(), 2U);
  const std::pair<QOR_CORE_REF, unsigned> cores[] = {{{0, 1, 0}, 1}, {{0, 1, 1}, 0}, {{1, 1, 0}, 1}};
  for (auto [ref, isVio] : cores) {
    unsigned result = 99;
    EXPECT_EQ(QorVIO_isVIOCore(board.session, ref, &result), 0U);
    EXPECT_EQ(result, isVio);
  }
  unsigned result = 99;
  EXPECT_NE(QorVIO_isVIOCore(board.session, {0, 1, 15}, &result),
            0U);  // the hub says so: no failure of the link
  EXPECT_EQ(result, 0U);
  QORVIO_CORE_INFO older{};
  EXPECT_EQ(QorVIO_getInfo(board.session, {1, 1, 0}, &older), 0U);
  EXPECT_EQ(older.core_major_version, 6U);
  EXPECT_EQ(older.core_minor_version, 1U);
  EXPECT_EQ(older.async_input_count, 16U);
  EXPECT_TRUE(board.takeMessages().empty());
}

TEST(Names, GoOutThroughTheDesignAndBackWithTheirActivity) {
  Board board(chain()
                  .device(0x11)
                  .core(2, 5, vio().asyncOut(12).asyncIn(12).syncOut(4).syncIn(4).design(loopback()))
                  .device()
                  .cable());
  VioCore core(board, {0, 2, 5});
  core.define("bus", asyncOut, {11, 3, 7, 0});
  core.define("bus", asyncIn, {11, 3, 7, 0});
  core.define("nibble", syncOut, {3, 2, 1, 0});
  core.define("nibble", syncIn, {3, 2, 1, 0});
  core.write({{"bus", "9"}, {"nibble", "6"}});
  TextMap values = core.read();
  EXPECT_EQ(values["bus"], "9");
  EXPECT_EQ(values["async_in_data"], "801");
  EXPECT_EQ(values["bus.activity_up"], "9");
  EXPECT_EQ(values["bus.activity_down"], "0");
  EXPECT_EQ(values["nibble"], "6");
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
  VioCore core(board, first);
  core.define("pulse", syncOut, {0});
  core.define("other", syncOut, {1});
  seen.clear();
  core.write({{"pulse.pulsetrain", "01000100000100000001000100010000"}});
  core.read();
  // Step 0 is the rightmost byte; eight clocks follow each frame of a write, and each frame of a read.
  EXPECT_EQ(seen, "0010101000100101" + std::string(24, '1'));
  seen.clear();
  core.write({{"other", "1"}});
  EXPECT_EQ(seen, std::string(16, '1'));
}

TEST(PulseTrains, OfABurstCarrySixteenSamplesAWrite) {
  Bytes seen;
  auto watch = [&](qorsim::Ports& ports) {
    seen.push_back(static_cast<unsigned char>(ports.syncOut[0] | ports.syncOut[1] << 1));
  };
  Board board(chain().device(0x11).core(1, 0, vio().syncOut(2).design(qorsim::callback(watch))).cable());
  VioCore core(board, first);
  seen.clear();
  Bytes samples(20);
  for (std::size_t i = 0; i < samples.size(); ++i) samples[i] = static_cast<unsigned char>(i % 4);
  const unsigned char* values[] = {samples.data()};
  unsigned sizes[] = {20};
  core.object().writeValues(board.session, first, {"sync_out_data"}, values, sizes, 1, 20, 1);
  Bytes expected = samples;
  expected.resize(32, samples.back());
  EXPECT_EQ(seen, expected);
}

TEST(Activity, OfGlitchesIsOfTheAsynchronousKindAndIsClearedByTheRead) {
  int clock = 0;
  auto glitch = [&](qorsim::Ports& ports) {
    if (++clock != 1) return;
    ports.glitchAsyncIn(1);
    ports.glitchSyncIn(0);
  };
  Board board(
      chain().device(0x11).core(1, 0, vio().asyncIn(2).syncIn(1).design(qorsim::callback(glitch))).cable());
  VioCore core(board, first);
  TextMap values = core.read();
  for (const auto& [key, text] : TextMap{{"async_in_data", "0"},
                                         {"async_in_data.activity_up", "2"},
                                         {"async_in_data.activity_down", "2"},
                                         {"sync_in_data.activity_up", "1"},
                                         {"sync_in_data.activity_down", "1"},
                                         {"sync_in_data.sync_activity_up", "0"},
                                         {"sync_in_data.sync_activity_down", "0"}})
    EXPECT_EQ(values[key], text) << key;
  values = core.read();
  EXPECT_EQ(values["async_in_data.activity_up"], "0");
  EXPECT_EQ(values["sync_in_data.activity_down"], "0");
}

TEST(WholePorts, KeepWhatTheMaskLeavesOut) {
  Board board(chain()
                  .device(0x11)
                  .core(1, 0, vio().asyncOut(10).asyncIn(10).syncOut(10).syncIn(10).design(loopback()))
                  .cable());
  VioCore core(board, first);
  const Bytes ones(32, 0xFF), none(32, 0), low{0x0F, 0x00};
  EXPECT_EQ(
      QorVIO_setPortBits(board.session, first, ones.data(), ones.data(), 10, ones.data(), ones.data(), 10),
      0U);
  EXPECT_EQ(
      QorVIO_setPortBits(board.session, first, none.data(), low.data(), 10, none.data(), low.data(), 10), 0U);
  Bytes async(2), asyncDown(2), sync(2), syncSyncDown(2);
  EXPECT_EQ(QorVIO_getPortBits(board.session, first, async.data(), nullptr, asyncDown.data(), 10, sync.data(),
                               nullptr, nullptr, nullptr, syncSyncDown.data(), 10),
            0U);
  EXPECT_EQ(async, (Bytes{0xF0, 0x03}));
  EXPECT_EQ(asyncDown, (Bytes{0x0F, 0x00}));
  EXPECT_EQ(sync, (Bytes{0xF0, 0x03}));
  EXPECT_EQ(syncSyncDown, (Bytes{0x0F, 0x00}));
}

TEST(WholePorts, GoRoundAtEveryWidthAndPlaceOnTheChain) {
  for (unsigned width : {1U, 7U, 8U, 33U, 4096U, 65535U}) {
    for (unsigned place : {0U, 2U}) {
      auto builder = chain();
      for (unsigned device = 0; device < place; ++device) builder.device(device).irLength(4 + device);
      builder.device(0x11).core(
          3, 9, vio().asyncOut(width).asyncIn(width).syncOut(width).syncIn(width).design(loopback()));
      builder.device().irLength(11);
      Board board(builder.cable());
      const QOR_CORE_REF ref{place, 3, 9};
      VioCore core(board, ref);
      const std::size_t bytes = (width + 7) / 8;
      Bytes values(bytes), steps(16 * bytes), ones(bytes, 0xFF), async(bytes), sync(bytes);
      std::iota(values.begin(), values.end(), static_cast<unsigned char>(0x35));
      std::iota(steps.begin(), steps.end(), static_cast<unsigned char>(0x9C));
      EXPECT_EQ(QorVIO_setPortBits(board.session, ref, values.data(), ones.data(), width, steps.data(),
                                   ones.data(), width),
                0U);
      EXPECT_EQ(QorVIO_getPortBits(board.session, ref, async.data(), nullptr, nullptr, width, sync.data(),
                                   nullptr, nullptr, nullptr, nullptr, width),
                0U);
      Bytes lastStep(steps.end() - static_cast<std::ptrdiff_t>(bytes), steps.end());
      const auto top = static_cast<unsigned char>(0xFF >> (8 * bytes - width));
      values.back() &= top;
      lastStep.back() &= top;
      EXPECT_EQ(async, values) << width << " bits, device " << place;
      EXPECT_EQ(sync, lastStep) << width << " bits, device " << place;
    }
  }
}

TEST(Exchanges, AreOneAWriteAndOneARead) {
  auto cable = chain().device(0x11).core(1, 0, vio().asyncOut(64).asyncIn(64).design(loopback())).cable();
  const qorsim::SimCable& counted = *cable;
  Board board(std::move(cable));
  VioCore core(board, first);
  for (unsigned i = 0; i < 64; ++i) core.define("in" + std::to_string(i), asyncIn, {i});
  auto before = counted.exchanges();
  core.write({{"async_out_data", "5"}});
  EXPECT_EQ(counted.exchanges() - before, 1U);
  core.read();
  EXPECT_EQ(counted.exchanges() - before, 2U);
}

TEST(BoardFile, IsAsGoodAsABuilder) {
  Board board("sim:" QORVIO_SOURCE_DIR "/examples/boards/lab.toml");
  unsigned isVio = 0;
  EXPECT_EQ(QorVIO_isVIOCore(board.session, first, &isVio), 0U);
  EXPECT_EQ(isVio, 1U);
}

}  // namespace
