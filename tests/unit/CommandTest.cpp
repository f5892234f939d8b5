// Command texts, whole, and the decoding of what a read returns.
#include "QorVIO_Command.h"
#include "VioTest.h"

namespace {

QorRT::QorVIO_Command commandFor(unsigned asyncIn, unsigned syncIn, unsigned asyncOut, unsigned syncOut) {
  QORVIO_CORE_INFO info{};
  info.async_input_count = asyncIn;
  info.sync_input_count = syncIn;
  info.async_output_count = asyncOut;
  info.sync_output_count = syncOut;
  QorRT::QorVIO_Command command;
  command.initFromCoreInfo(info);
  return command;
}

TEST_F(VioTest, CommandTextsHoldWhatEachWidthAsksFor) {
  struct {
    unsigned asyncIn, syncIn, asyncOut, syncOut, code;
    const char* text;
    unsigned resultBits;
  } const cases[] = {
      {1, 2, 2, 1, 1, "0A 1 F 01 0 00000016 000000", 0},
      {1, 2, 2, 1, 2, "0A 1 F 02 0 00000004 0", 0},
      {1, 2, 2, 1, 3, "0A 1 F 03 1 00000020 0\n0A 1 F 04 1 00000004 0", 40},
      {0, 3, 0, 0, 3, "0A 1 F 03 1 00000022 0\n0A 1 F 04 1 00000004 0", 48},
      {0, 0, 0, 1, 1, "0A 1 F 01 0 00000012 00000", 0},
      {1, 2, 2, 1, 4, "", 0},
      {1, 2, 2, 1, 0, "", 0},
  };
  for (const auto& c : cases) {
    auto command = commandFor(c.asyncIn, c.syncIn, c.asyncOut, c.syncOut);
    std::string text = "old";
    unsigned bits = 99;
    EXPECT_EQ(command.buildCommandText({10, 1, 15}, c.code, text, &bits), c.text);
    EXPECT_EQ(bits, c.resultBits);
    EXPECT_EQ(command.buildCommandText({10, 1, 15}, c.code, text, nullptr), c.text);
  }
}

TEST_F(VioTest, AWriteIsOneTextAndOneFlush) {
  initCore(1, 2, 2, 1);
  EXPECT_EQ(QorVIO_defineSignal(session, ref, "first", asyncOut, 0), 0U);
  siblings.take();
  EXPECT_EQ(write({{"first", "1"}}), 0U);
  EXPECT_THAT(siblings.take(),
              ElementsAre("lock 7 60000", "sequence 00 1 0 01 0 00000016 100004\n00 1 0 02 0 00000004 0",
                          "flush 7", "unlock 7"));
  EXPECT_EQ(write({}), 0U);  // sent all the same, addressing nothing
  EXPECT_THAT(siblings.take(),
              ElementsAre("lock 7 60000", "sequence 00 1 0 01 0 00000016 100000\n00 1 0 02 0 00000004 0",
                          "flush 7", "unlock 7"));
}

TEST_F(VioTest, AReadIsOneTextAndItsRecordsFillTheImage) {
  initCore(1, 2, 2, 1);
  siblings.readDigits = "1100101100010010";
  TextMap map = read({{"note", "mine"}, {"sync_in_data", "old"}});
  EXPECT_THAT(siblings.take(),
              ElementsAre("lock 7 60000", "sequence 00 1 0 03 1 00000020 0\n00 1 0 04 1 00000004 0 -> 40",
                          "unlock 7"));
  EXPECT_EQ(map, (TextMap{{"note", "mine"},
                          {"async_in_data", "1"},
                          {"async_in_data.value", "1"},
                          {"async_in_data.activity_up", "1"},
                          {"async_in_data.activity_down", "0"},
                          {"sync_in_data", "1"},
                          {"sync_in_data.value", "1"},
                          {"sync_in_data.activity_up", "2"},
                          {"sync_in_data.activity_down", "1"},
                          {"sync_in_data.sync_activity_up", "1"},
                          {"sync_in_data.sync_activity_down", "2"}}));
}

TEST_F(VioTest, ACoreWithoutOutputsOrInputsSendsNothing) {
  initCore(0, 0, 0, 0);
  EXPECT_EQ(write({}), 0U);
  EXPECT_TRUE(read().empty());
  EXPECT_THAT(siblings.take(), ElementsAre("lock 7 60000", "unlock 7", "lock 7 60000", "unlock 7"));
}

TEST_F(VioTest, AFailedReadLeavesTheImageAndTheMap) {
  initCore(1, 2, 2, 1);
  siblings.readDigits = "1111111111111111";
  read();
  siblings.before["sequence"] = [] { throw std::runtime_error("link"); };
  TextMap map{{"async_in_data", "mine"}};
  TextMap* pointer = &map;
  EXPECT_EQ(QorVIO_readValues(session, ref, &pointer), failed);
  EXPECT_EQ(map, (TextMap{{"async_in_data", "mine"}}));
  unsigned char bit = 0;
  EXPECT_EQ(QorVIO_getPortBits(session, ref, &bit, nullptr, nullptr, 1, nullptr, nullptr, nullptr, nullptr,
                               nullptr, 0),
            failed);
  EXPECT_EQ(bit, 0);
}

TEST_F(VioTest, AnAddressTooWideForItsFieldIsRefusedBeforeAnythingIsSent) {
  const QOR_CORE_REF wide{256, 1, 0};
  siblings.answerAsVioCore(1, 2, 2, 1);
  EXPECT_EQ(QorVIO_initCore(session, wide), 0U);
  siblings.take();
  TextMap map;
  TextMap* pointer = &map;
  EXPECT_EQ(QorVIO_writeValues(session, wide, &pointer), failed);
  EXPECT_THAT(siblings.take(), ElementsAre("lock 7 60000", "unlock 7", testing::StartsWith("message 100 ")));
}

}  // namespace
