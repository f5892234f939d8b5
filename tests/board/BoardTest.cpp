// A board by the names of its signals, of two cores at once.
#include "board/Board.h"

#include <gtest/gtest.h>

#include "FaultyCable.h"
#include "Sim.h"
#include "board/model/CoreAddress.h"
#include "board/record/Recording.h"

namespace {

using namespace std::chrono_literals;
using qor::Drive;

const std::string signalsFile = QORVIO_SOURCE_DIR "/examples/boards/demo-signals.toml";

template <class Action>
std::string messageOf(Action action) {
  try {
    action();
  } catch (const qor::Error& error) {
    return error.what();
  }
  return "";
}

TEST(Board, WritesAndReadsByName) {
  qor::Board board("sim:", signalsFile);
  board.write({{"leds", 0xA}, {"mode", "fast"}, {"gain", -1.5}, {"go", qor::pulse(3)}});
  const qor::Frame frame = board.read();
  EXPECT_EQ(frame["leds"].number(), 0xAU);
  EXPECT_TRUE(frame["leds"] == 0xA && frame["mode"] == "fast" && frame["leds[3]"].rose() &&
              !frame["leds[0]"].moved());
  EXPECT_EQ(frame["gain"].scaled(), -1.5);
  EXPECT_EQ(frame["gain"].signedNumber(), -3);
  EXPECT_EQ(frame["mode"].name(), "fast");
  EXPECT_TRUE(frame["ready"].rose() && frame["ready"].fell() && frame["ready"].syncRose());
  EXPECT_EQ(frame["leds"].upBits(), qor::Bytes{0xA});
  EXPECT_TRUE(frame["count"].moved());
  EXPECT_EQ(frame["count"].number(), frame["1.1.0/async_in_data"].number());
  EXPECT_FALSE(board.read()["leds"].moved());
  EXPECT_FALSE(board.toggle("leds[3]"));
  EXPECT_EQ(board.lastGiven(board.signals().find("leds", qor::Direction::output)), qor::Bytes{2});
}

TEST(Board, RefusesBeforeAnythingIsSent) {
  qor::Board board("sim:", signalsFile);
  const std::pair<std::vector<Drive>, const char*> rows[] = {
      {{{"leds", 1}, {"lads", 1}}, "no output of that name (did you mean leds?): lads"},
      {{{"leds", 1}, {"LEDS", 2}}, "an output is given two values: leds"},
      {{{"leds", 1}, {"ready", 2}}, "no output of that name (it is an input): ready"},
      {{{"leds", 16}}, "leds has 4 bits, too few for the value: 16"},
      {{{"leds", qor::pulse()}}, "leds has 4 bits; name one of them: leds[0]"},
      {{{"go", qor::pulse(0)}}, "a pulse must be 1 to 15 steps wide: 0"},
      {{{"go", qor::pulse(6, 10)}},
       "a pulse must begin and end within 16 steps, the last of them low: steps 10 to 15"},
      {{{"leds", qor::Train{{1}}}}, "an asynchronous output plays no pulse train: leds"},
      {{{"go", qor::Train{std::vector<qor::Value>(17, 1)}}},
       "a pulse train of go has 1 to 16 values, not 17"},
  };
  for (const auto& [drives, wanted] : rows)
    EXPECT_EQ(messageOf([&, &d = drives] { board.write(d); }), wanted);
  EXPECT_FALSE(board.read()["leds"].moved());
  EXPECT_THROW(board.read("lads"), qor::UnknownSignal);
}

TEST(Board, WaitsUntilAConditionOrATimeOrAStop) {
  bool isStopped = false;
  qor::BoardOptions options;
  options.stop = [&] { return isStopped; };
  qor::Board board("sim:", signalsFile, options);
  EXPECT_TRUE(board.waitFor(board.condition("count[7:0] > 0xF0 && !leds"), 60s)["count[7:0]"].number() >
              0xF0);
  board.write({{"go", qor::pulse()}});
  board.waitFor(board.condition("ready rises"), 60s);
  EXPECT_TRUE(board.read()["ready"].rose()) << "what moved during a wait is reported by the next read";
  EXPECT_EQ(messageOf([&] { board.waitFor("mode", "fast", 2ms); }),
            "not within 2 ms: mode == fast; mode is off");
  EXPECT_THROW(board.waitFor("mode", "fast", 0s), qor::Timeout);
  isStopped = true;
  EXPECT_THROW(board.waitFor("mode", "fast", 1h), qor::Stopped);
}

TEST(Board, ChoosesItsCores) {
  qor::BoardOptions options;
  options.core = qor::parseRef("1.1.0");
  EXPECT_EQ(messageOf([&] { qor::Board("sim:", signalsFile, options); }),
            signalsFile + ": the signals are for core 0.1.0, asked for is: 1.1.0");
  EXPECT_EQ(qor::refText(qor::Board("sim:", "", options).core().ref()), "1.1.0");
  options.forceCore = true;
  EXPECT_EQ(messageOf([&] { qor::Board("sim:", signalsFile, options); }),
            signalsFile + ": mode: bit 5 is beyond async_out, which has 4 bits");
  EXPECT_EQ(qor::refText(qor::Board("sim:").core().ref()), "0.1.0");
}

TEST(Poller, ReadsOnceForAllAndLosesNoFlag) {
  qor::Board board("sim:", signalsFile);
  const auto inputs = [&](const std::vector<std::string>& names) {
    return board.signals().select(names, qor::Direction::input);
  };
  qor::Subscription fast(board.poller(), inputs({"leds", "mode"})), slow(board.poller(), inputs({"leds"}));
  const auto up = [](qor::Subscription& each) { return each.look()[0].asyncUp[0]; };
  for (unsigned value : {1U, 0U, 2U, 0U}) {
    board.write({{"leds", value}});
    board.poller().poll();
    EXPECT_EQ(up(fast), value);
  }
  EXPECT_EQ(slow.pending()[0].asyncUp[0], 3);
  EXPECT_EQ(up(slow), 3);
  EXPECT_EQ(up(slow), 0) << "no poll, no activity";
  EXPECT_EQ(slow.look()[0].asyncIn[0], 0);
  EXPECT_TRUE(fast.look()[1].asyncIn.empty()) << "the other core is not read for it";
}

TEST(Poller, LosesNothingOfTheCoresBeforeTheOneThatFailed) {
  auto* const link = new qorsim::FaultyCable(qorsim::demoBoard().cable());
  qor::Board board(std::unique_ptr<QorRT::Qor_Cable>(link), qor::readSignalFile(signalsFile));
  qor::Subscription all(board.poller());
  board.write({{"leds", 1}});
  link->next({});
  link->next(qorsim::failAt(1));
  EXPECT_THROW(board.poller().pollAll(), qor::Failure);
  board.poller().pollAll();
  EXPECT_EQ(all.look()[0].asyncUp[0], 1);
}

TEST(Recording, FillsArrays) {
  qor::Board board("sim:", signalsFile);
  const std::vector<qor::Signal> inputs = board.signals().select({"count", "leds"}, qor::Direction::input);
  qor::Limits limits;
  limits.samples = 1000;
  const qor::Samples samples = qor::recordToArrays(board.poller(), inputs, limits);
  ASSERT_EQ(samples.nanoseconds.size(), 1000U);
  ASSERT_EQ(samples.inputs[0].values.size(), 2000U);
  const auto count = [&](std::size_t i) {
    return samples.inputs[0].values[2 * i] + 256U * samples.inputs[0].values[2 * i + 1];
  };
  EXPECT_EQ((count(999) - count(0)) & 0xFFFF, (999 * (count(1) - count(0))) & 0xFFFF);
  EXPECT_EQ(samples.inputs[0].moves[500], 3);
  EXPECT_EQ(samples.inputs[1].moves[500], 0);
  limits.samples = 0;
  limits.when = board.condition("count[15]");
  limits.before = 4;
  limits.after = 2;
  const qor::Samples around = qor::recordToArrays(board.poller(), inputs, limits);
  ASSERT_EQ(around.missed.size(), 7U);
  EXPECT_EQ(around.trigger, 4U);
  EXPECT_EQ(around.nanoseconds[0], 0);
  EXPECT_GE(around.inputs[0].values[9], 0x80);
}

}  // namespace
