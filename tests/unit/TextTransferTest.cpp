// Values by name, as hexadecimal text.
#include "VioTest.h"

namespace {

class TextWrite : public VioTest {
 protected:
  TextWrite() {
    initCore(1, 1, 16, 10);
    EXPECT_EQ(define("bit", asyncOut, {0}), 0U);
    EXPECT_EQ(define("byte", asyncOut, {0, 1, 2, 3, 4, 5, 6, 7}), 0U);
    EXPECT_EQ(define("bus12", asyncOut, {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11}), 0U);
    EXPECT_EQ(define("bus16", asyncOut, {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15}), 0U);
    EXPECT_EQ(define("pulse", syncOut, {0}), 0U);
    EXPECT_EQ(define("nibble", syncOut, {9, 8, 7, 6}), 0U);
    siblings.take();
  }

  std::string digits() { return writtenDigits(16 + 160 + 16 + 10); }

  /// The asynchronous output port as a number.
  unsigned asyncValue(const std::string& all) {
    unsigned value = 0;
    for (unsigned i = 0; i < 16; ++i) value |= static_cast<unsigned>(all[i] - '0') << i;
    return value;
  }

  static std::string train(const std::string& all, unsigned bit) { return all.substr(16 + 16 * bit, 16); }
};

TEST_F(TextWrite, FitsTextsToTheWidth) {
  struct {
    const char* key;
    const char* text;
    unsigned value;
  } const cases[] = {
      {"bus12", "F0", 0xFF0},
      {"bus12", "70", 0x070},
      {"bus12", "abc", 0xABC},
      {"bit", "1", 1},
      {"bit", "8", 0},
      {"byte", "1234", 0x34},
      {"byte", "0x1F", 0x1F},
      {"byte", "??1F", 0x1F},
      {"bus16.value", "8", 0xFFF8},
      {"BUS16", "7", 7},
      {"bus16.PULSETRAIN", "1234", 0x1234},
      {"bus16.b.pulsetrain", "Fe", 0xFFFE},
      {"bus16.", "5", 5},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(write({{"bus16", "0"}}), 0U);
    digits();
    EXPECT_EQ(write({{c.key, c.text}}), 0U);
    EXPECT_EQ(asyncValue(digits()), c.value) << c.key << '=' << c.text;
  }
}

TEST_F(TextWrite, RefusesWhatIsNoHexadecimalNumber) {
  for (auto [key, text, quoted] : {std::array{"bus16", "0x1F", "0x1F"},
                                   {"bus16", "G1", "G"},
                                   {"bus16", "12G4", "12G4"},
                                   {"byte", "", ""},
                                   {"byte", "12 4", "12 4"},
                                   {"pulse.pulsetrain", "0G", "0G"},
                                   {"bus12", "-1", "-"}}) {
    EXPECT_EQ(write({{key, text}}), failed);
    EXPECT_THAT(siblings.take(), locked(std::string("Invalid Hex String: ") + quoted));
  }
}

TEST_F(TextWrite, PulseTrainsHoldStepZeroInTheRightmostBytes) {
  struct {
    const char* key;
    const char* text;
    unsigned bit;
    const char* train;
  } const cases[] = {
      {"pulse.pulsetrain", "F", 0, "1111111111111111"},
      {"pulse.pulsetrain", "8", 0, "0111111111111111"},
      {"nibble.pulsetrain", "0102", 9, "0100000000000000"},
      {"nibble.pulsetrain", "0102", 8, "1000000000000000"},
      {"pulse.pulsetrain", "01000000", 0, "0001000000000000"},
      {"pulse", "1", 0, "1111111111111111"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(write({{c.key, c.text}}), 0U);
    EXPECT_EQ(train(digits(), c.bit), c.train) << c.key << '=' << c.text;
  }
  std::string whole(
      64, '0');  // the field of a one-byte value: 32 digits are checked only, step 15 leads the others
  whole[0] = 'A';
  whole.replace(32, 2, "01");
  EXPECT_EQ(write({{"pulse.pulsetrain", whole}}), 0U);
  EXPECT_EQ(train(digits(), 0), "0000000000000001");
  whole[0] = 'x';
  EXPECT_EQ(write({{"pulse.pulsetrain", whole}}), failed);
}

TEST_F(TextWrite, OnlyWhatTheMapNamesIsAddressed) {
  EXPECT_EQ(write({{"bus12", "FFF"}, {"pulse", "1"}, {"nibble", "F"}}), 0U);
  EXPECT_EQ(digits().substr(176),
            "1111111111110000"
            "1000001111");
  EXPECT_EQ(write({{"bit", "0"}}), 0U);
  std::string all = digits();
  EXPECT_EQ(all.substr(176),
            "1000000000000000"
            "0000000000");
  EXPECT_EQ(asyncValue(all), 0xFFEU);
  EXPECT_EQ(train(all, 6), "1111111111111111");
}

TEST_F(TextWrite, AFailedCheckStagesNothingAndAFailedTextAddressesNothingLater) {
  const std::pair<TextMap, const char*> cases[] = {
      {{{"bit", "1"}, {"nobody.value", "1"}}, "Could not find a signal with the name: nobody"},
      {{{"bit", "1"}, {"async_in_data", "1"}}, "Could not find a signal with the name: async_in_data"},
      {{{"bit", "1"}, {"", "1"}}, "Could not find a signal with the name: "},
      {{{"bit", "1"}, {"byte.pulsetrain", "zz"}},
       ".pulsetrain cannot be used with the non-synchronous output: byte"},
  };
  for (const auto& [map, message] : cases) {
    EXPECT_EQ(write(map), failed);
    EXPECT_THAT(siblings.take(), locked(message));
  }
  EXPECT_EQ(write({}), 0U);
  EXPECT_EQ(digits(), std::string(202, '0'));

  EXPECT_EQ(write({{"bit", "1"}, {"byte", "zz"}, {"pulse", "1"}}), failed);
  siblings.take();
  EXPECT_EQ(write({}), 0U);
  EXPECT_EQ(digits().substr(176), std::string(26, '0'));
}

TEST_F(VioTest, AReadGivesEveryInputUnderTheNameThatWasDefined) {
  initCore(4, 2, 1, 0);
  EXPECT_EQ(define("Bus", asyncIn, {3, 0, 0, 1, 2}), 0U);
  EXPECT_EQ(define("s", syncIn, {1}), 0U);
  siblings.readDigits =
      "1000"
      "0100"
      "0010"
      "1110"
      "000000"
      "110100";
  TextMap map = read();
  EXPECT_EQ(map.count("bus"), 0U);
  EXPECT_EQ(map["Bus"], "07");
  EXPECT_EQ(map["Bus.value"], "07");
  EXPECT_EQ(map["Bus.activity_up"], "09");
  EXPECT_EQ(map["Bus.activity_down"], "11");
  EXPECT_EQ(map.count("Bus.sync_activity_up"), 0U);
  EXPECT_EQ(map["s"], "1");
  EXPECT_EQ(map["s.activity_up"], "1");
  EXPECT_EQ(map["s.activity_down"], "0");
  EXPECT_EQ(map["s.sync_activity_up"], "1");
  EXPECT_EQ(map["s.sync_activity_down"], "0");
  EXPECT_EQ(map["async_in_data"], "9");
  EXPECT_EQ(map["sync_in_data"], "2");
  EXPECT_EQ(map.size(), 4U + 6 + 4 + 6);
}

}  // namespace
