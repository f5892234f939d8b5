// Command texts, whole, and the decoding of what a read returns.
#include "tests/unit/VioTest.h"

namespace {

TEST_F(VioTest, AWriteIsOneTextAndOneFlushEvenOfNothing) {
  initCore(1, 2, 2, 1);
  EXPECT_EQ(QorVIO_defineSignal(session, ref, "first", asyncOut, 0), 0U);
  platform.take();
  const std::pair<TextMap, const char*> cases[] = {{{{"first", "1"}}, "100004"}, {{}, "100000"}};
  for (const auto& [map, data] : cases) {
    EXPECT_EQ(write(map), 0U);
    EXPECT_THAT(platform.take(),
                ElementsAre("lock 7 60000",
                            std::string("sequence 00 1 0 01 0 00000016 ") + data + "\n00 1 0 02 0 00000004 0",
                            "flush 7", "unlock 7"));
  }
}

TEST_F(VioTest, AReadIsOneTextAndGivesEveryInputUnderTheNameThatWasDefined) {
  initCore(4, 2, 1, 0);
  EXPECT_EQ(define("Bus", asyncIn, {3, 0, 0, 1, 2}), 0U);
  EXPECT_EQ(QorVIO_undefineName(session, ref, "async_in_data", asyncIn), 0U);
  platform.take();
  platform.readDigits =
      "1000"
      "0100"
      "0010"
      "1110"
      "000000"
      "100110";
  const TextMap expected{{"note", "mine"},
                         {"Bus", "07"},
                         {"Bus.value", "07"},
                         {"Bus.activity_up", "09"},
                         {"Bus.activity_down", "11"},
                         {"sync_in_data", "2"},
                         {"sync_in_data.value", "2"},
                         {"sync_in_data.activity_up", "0"},
                         {"sync_in_data.activity_down", "0"},
                         {"sync_in_data.sync_activity_up", "2"},
                         {"sync_in_data.sync_activity_down", "2"}};
  EXPECT_EQ(read({{"note", "mine"}, {"sync_in_data", "old"}}), expected);
  EXPECT_THAT(platform.take(),
              ElementsAre("lock 7 60000", "sequence 00 1 0 03 1 0000002C 0\n00 1 0 04 1 00000004 0 -> 56",
                          "unlock 7"));
}

TEST_F(VioTest, ACoreWithoutOutputsOrInputsSendsNothing) {
  initCore(0, 0, 0, 0);
  EXPECT_EQ(write({}), 0U);
  EXPECT_TRUE(read().empty());
  EXPECT_THAT(platform.take(), ElementsAre("lock 7 60000", "unlock 7", "lock 7 60000", "unlock 7"));
}

TEST_F(VioTest, AnAddressTooWideForItsFieldIsRefusedBeforeAnythingIsSent) {
  platform.answerAsVioCore(1, 2, 2, 1);
  auto writeTo = [&](QOR_CORE_REF at) {
    EXPECT_EQ(QorVIO_initCore(session, at), 0U);
    platform.take();
    return QorVIO_setPortBits(session, at, nullptr, nullptr, 0, nullptr, nullptr, 0);
  };
  EXPECT_EQ(writeTo({10, 1, 15}), 0U);
  EXPECT_EQ(platform.take().at(1), "sequence 0A 1 F 01 0 00000016 000000\n0A 1 F 02 0 00000004 0");
  EXPECT_EQ(writeTo({256, 1, 0}), failed);
  EXPECT_THAT(platform.take(), ElementsAre("lock 7 60000", "unlock 7", testing::StartsWith("message 100 ")));
}

}  // namespace
