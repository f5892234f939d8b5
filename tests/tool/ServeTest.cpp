// The parts of a server of a board, without sockets.
#include <gtest/gtest.h>

#include "board/Board.h"
#include "board/served/Messages.h"
#include "tools/qorvio/serve/Access.h"
#include "tools/qorvio/serve/Claims.h"
#include "tools/qorvio/serve/FrameTexts.h"
#include "tools/qorvio/serve/Metrics.h"

namespace {

using namespace qor::tool;
using qor::Json;

const std::string signalsFile = QORVIO_SOURCE_DIR "/examples/boards/demo-signals.toml";

std::string kindOfReading(const char* text) {
  try {
    qor::assignmentIn(qor::parseMessage(text), {QORVIO_CORE_INFO{81, 9, 10, 0, 0, 1, 0, 0, 8, 8, 8, 8}});
  } catch (const qor::Error& error) {
    return qor::kindOf(error);
  }
  return "";
}

TEST(Serve, MessagesComeBackAsTheyWere) {
  qor::Board board("sim:", signalsFile);
  for (const qor::Signal& each : board.signals().signals()) {
    const Json json = qor::jsonOf(each);
    EXPECT_EQ(qor::jsonOf(qor::signalIn(qor::parseMessage(qor::textOf(json)))), json);
  }
  const auto drives = {qor::Drive("leds", 0xA), qor::Drive("gain", qor::Train{{1, 2, -1.5}})};
  for (const qor::Assignment& each : qor::assignmentsOf(drives, board.signals())) {
    const Json json = qor::jsonOf(each);
    const qor::Assignment again = qor::assignmentIn(json, {board.core(0).info(), board.core(1).info()});
    EXPECT_EQ(again.steps, each.steps);
    EXPECT_EQ(again.signal.bits, each.signal.bits);
  }
}

TEST(Serve, MessagesOfOthersAreNotBelieved) {
  for (const char* text : {"", "[]", "{", R"({"core":1})", R"({"core":0,"port":"async_in","bits":"0"})",
                           R"({"core":0,"port":"async_out","bits":"8","name":"","steps":["1"]})",
                           R"({"core":0,"port":"async_out","bits":"0","name":"","steps":["2"]})",
                           R"({"core":0,"port":"sync_out","bits":"0","name":"","steps":["1","0"]})",
                           R"({"core":-1,"port":"sync_out","bits":"0","name":"","steps":["1"]})",
                           "[[[[[[[[[[[[[[[[[[[[[[[[[[[[[[]]]]]]]]]]]]]]]]]]]]]]]]]]]]]]"})
    EXPECT_EQ(kindOfReading(text), "use") << text;
  EXPECT_EQ(kindOfReading(R"({"core":0,"port":"sync_out","bits":"7:0","name":"","steps":["FF"]})"), "");
}

TEST(Serve, AnotherLookGoesOnWhereTheFirstOneIs) {
  qor::Board board("sim:", signalsFile);
  qor::Subscription first(board.poller());
  board.poller().pollAll();
  first.look();
  board.write("leds", 0x5);
  board.poller().poll(0);
  qor::Subscription second(first);
  board.write("leds", 0x0);
  board.poller().pollAll();
  const qor::Signal leds = board.signals().find("leds", qor::Direction::input);
  for (qor::Subscription* each : {&first, &second}) {
    const std::vector<qor::Sample>& samples = each->look();
    EXPECT_TRUE(qor::anyOf(leds, samples[0].asyncUp) && qor::anyOf(leds, samples[0].asyncDown));
  }
}

TEST(Serve, FramesHaveWhatChanged) {
  qor::Board board("sim:", signalsFile);
  const std::vector<qor::Signal> signals = servedSignals(board.signals());
  ASSERT_EQ(signals.size(), 9U);  // no whole ports
  Claims claims({board.core(0).info(), board.core(1).info()});
  InputTexts inputs({signals.begin(), signals.end() - 1});  // without the counter
  OutputTexts outputs(signals, board, claims);
  qor::Subscription live(board.poller());
  board.write({{"leds", 0xA}, {"go", qor::pulse()}});
  claims.take(std::make_shared<Owner>(Owner{7, "b\"3", 12}), signals[0]);
  board.poller().pollAll();
  EXPECT_EQ(inputs.changed(live.look()), R"([1,"A",1],[5,"0",15])");
  EXPECT_EQ(outputs.changed(), R"([0,"A",{"client":7,"name":"b\"3","since":12}])");
  board.poller().pollAll();
  EXPECT_EQ(inputs.changed(live.look()), "");
  EXPECT_EQ(inputs.all(live.pending()).find(R"([1,"A",)"), 0U);
  EXPECT_EQ(outputs.changed(), "");
}

TEST(Serve, OutputsBelongToWhoDroveThemFirst) {
  Claims claims({QORVIO_CORE_INFO{81, 9, 10, 0, 0, 1, 0, 0, 8, 8, 8, 8}});
  const qor::Signal leds{"leds", qor::Port::asyncOut, {0, 1, 2}}, led{"leds[2]", qor::Port::asyncOut, {2}};
  claims.take(std::make_shared<Owner>(Owner{1, "bench-3", 0}), leds);
  EXPECT_NO_THROW(claims.require(1, led));
  try {
    claims.require(2, led);
    ADD_FAILURE();
  } catch (const qor::Driven& error) {
    EXPECT_EQ(std::string(error.what()).find("leds[2] is driven by bench-3, since 19"), 0U) << error.what();
  }
  claims.take(std::make_shared<Owner>(Owner{2, "bench-4", 0}), led);
  claims.releaseAll(1);
  EXPECT_EQ(claims.ownerOf(leds)->name, "bench-4");
  claims.release(2, leds);
  EXPECT_EQ(claims.ownerOf(leds), nullptr);
}

TEST(Serve, StrangersAreKnown) {
  const Access access("secret", {"localhost", "[::1]"});
  for (const char* token : {"", "secre", "secret ", "secretsecret", "sEcret"})
    EXPECT_FALSE(access.isToken(token));
  EXPECT_TRUE(access.isToken("secret"));
  for (const char* host : {"localhost", "LocalHost:9825", "[::1]:9825", "[::1]"})
    EXPECT_TRUE(access.isHost(host));
  for (const char* host : {"", "evil.example", "localhost.evil.example", "evil.example:9825"})
    EXPECT_FALSE(access.isHost(host)) << host;
  EXPECT_TRUE(Access::isOrigin("", "localhost:1") && Access::isOrigin("https://localhost:1", "localhost:1"));
  for (const char* origin : {"null", "http://localhost:2", "http://evil.example", "localhost:1"})
    EXPECT_FALSE(Access::isOrigin(origin, "localhost:1")) << origin;
}

TEST(Serve, MetricsAddUp) {
  qor::Board board("sim:", signalsFile);
  const qor::Frame frame = board.read();
  Counts counts;
  for (const double seconds : {0.0001, 0.003, 7.0}) counts.latency.add(seconds);
  const std::string text = metricsText(counts, {}, board.signals().signals(), frame.samples());
  for (const char* line :
       {"qorvio_poll_seconds_bucket{le=\"1e-04\"} 1\n", "_bucket{le=\"0.005\"} 2\n", "_bucket{le=\"1\"} 2\n",
        "_bucket{le=\"+Inf\"} 3\n", "_count 3\n", "qorvio_input{signal=\"gain\",unit=\"dB\"} 0\n"})
    EXPECT_NE(text.find(line), std::string::npos) << line << text;
}

}  // namespace
