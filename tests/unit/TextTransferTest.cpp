// Values by name, as hexadecimal text. More texts and keys: tests/fuzz/corpus/values.
#include "tests/unit/VioTest.h"

namespace {

class TextWrite : public VioTest {
 protected:
  TextWrite() {
    initCore(1, 1, 12, 2);
    EXPECT_EQ(define("bit", asyncOut, {0}), 0U);
    EXPECT_EQ(define("byte", asyncOut, {0, 1, 2, 3, 4, 5, 6, 7}), 0U);
    EXPECT_EQ(define("bus", asyncOut, {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11}), 0U);
    EXPECT_EQ(define("pulse", syncOut, {0}), 0U);
    platform.take();
  }

  std::string digits() { return writtenDigits(12 + 32 + 12 + 2); }
};

TEST_F(TextWrite, FitsTextsToTheWidth) {
  const std::string checkedOnly(30, 'A');
  const struct {
    std::string key, text, async, train;
  } cases[] = {
      {"bus", "F0", "000011111111", ""},
      {"bus.value", "70", "000011100000", ""},
      {"bit", "8", "000000000000", ""},
      {"byte", "0x1F", "111110000000", ""},
      {"BUS.PULSETRAIN", "0123", "110001001000", ""},
      {"bus.b.pulsetrain", "0fe1", "100001111111", ""},
      {"pulse", "1", "000000000000", "1111111111111111"},
      {"pulse.pulsetrain", "8", "000000000000", "0111111111111111"},
      {"pulse.pulsetrain", "01000000", "000000000000", "0001000000000000"},
      {"pulse.pulsetrain", "AA" + checkedOnly + "01" + std::string(30, '0'), "000000000000",
       "0000000000000001"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(write({{"bus", "0"}}), 0U);
    digits();
    EXPECT_EQ(write({{c.key, c.text}}), 0U);
    const std::string all = digits();
    EXPECT_EQ(all.substr(0, 12), c.async) << c.key << '=' << c.text;
    EXPECT_EQ(all.substr(12, c.train.size()), c.train) << c.key << '=' << c.text;
  }
}

TEST_F(TextWrite, StagesNothingOfAFailedCheckAndAddressesNothingAfterAFailedText) {
  const std::string noName = "Could not find a signal with the name: ", noNumber = "Invalid Hex String: ";
  const std::string tooLong = "x" + std::string(63, '0');
  const std::tuple<std::string, std::string, std::string> cases[] = {
      {"nobody.value", "1", noName + "nobody"},
      {"async_in_data", "1", noName + "async_in_data"},
      {"", "1", noName},
      {"byte.pulsetrain", "zz", ".pulsetrain cannot be used with the non-synchronous output: byte"},
      {"bus", "G1", noNumber + "G"},
      {"bus", "0x1F", noNumber + "0x1F"},
      {"byte", "", noNumber},
      {"pulse.pulsetrain", tooLong, noNumber + tooLong},
  };
  for (const auto& [key, text, message] : cases) {
    EXPECT_EQ(write({{"sync_out_data", "3"}, {key, text}, {"async_out_data", "0"}}), failed);
    EXPECT_THAT(platform.take(), locked(message));
    EXPECT_EQ(write({}), 0U);
    const std::size_t from = message.find(noNumber) == 0 ? 12 + 32 : 0;
    EXPECT_EQ(digits().substr(from), std::string(12 + 32 + 12 + 2 - from, '0'));
  }
}

}  // namespace
