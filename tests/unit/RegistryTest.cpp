// Defining, removing and sizing names.
#include "tests/unit/VioTest.h"

namespace {

const char* const beyond =
    "This signal cannot be defined because an index is greater than the number of this signal type.";

class Registry : public VioTest {
 protected:
  Registry() { initCore(4, 3, 8, 10); }

  std::vector<unsigned> sizes(std::vector<const char*> names, unsigned isOutput) {
    std::vector<unsigned> out(names.size(), 99);
    code = QorVIO_getSignalSizes(session, ref, names.data(), out.data(), static_cast<unsigned>(out.size()),
                                 isOutput);
    return out;
  }

  unsigned code = 0;
};

TEST_F(Registry, ChecksDefinitionsInOrderAndKeepsNothingOfAFailedOne) {
  EXPECT_EQ(define("Led", asyncOut, {3}), 0U);
  auto used = [](const std::string& name) {
    return "The name, " + name +
           ", is already used by another signal and will not be re-defined. Note: Signal names are "
           "case-insensitive";
  };
  struct {
    const char* name;
    unsigned type;
    std::vector<unsigned> bits;
    std::string message;
  } const cases[] = {
      {"", 7, {99}, "Invalid signal name."},
      {"x", 7, {99}, "This signal cannot be defined because the type is unknown."},
      {"x", asyncOut, {0, 8}, beyond},
      {"led", syncOut, {10}, beyond},
      {"x", asyncIn, {4}, beyond},
      {"x", syncIn, {0xFFFFFFFF}, beyond},
      {"lED", syncOut, {0}, used("lED")},
      {"sync_out_data", asyncOut, {0}, used("sync_out_data")},
  };
  for (const auto& c : cases) {
    platform.take();
    EXPECT_EQ(define(c.name, c.type, c.bits), failed);
    EXPECT_THAT(platform.take(), locked(c.message));
  }
  EXPECT_EQ(define("x", asyncOut, {7}), 0U);
  std::vector<unsigned> none;
  try {
    core().defineSignal("y", 7, none);
    ADD_FAILURE();
  } catch (const std::logic_error& e) {
    EXPECT_STREQ(e.what(), "This signal cannot be defined with a size of 0.");
  }
}

TEST_F(Registry, InputsAndOutputsAreTwoNameSpaces) {
  EXPECT_EQ(define("both", syncIn, {0, 1}), 0U);
  EXPECT_EQ(define("BOTH", syncOut, {9, 8, 7}), 0U);
  EXPECT_EQ(define("sync_out_data", asyncIn, {0}), 0U);
  EXPECT_THAT(sizes({"Both", "async_in_data", "sync_in_data"}, 0), ElementsAre(2, 4, 3));
  EXPECT_THAT(sizes({"Both", "async_out_data", "sync_out_data"}, 1), ElementsAre(3, 8, 10));
  EXPECT_EQ(QorVIO_undefineName(session, ref, "bOTH", asyncIn), 0U);  // direction alone counts
  EXPECT_EQ(QorVIO_undefineName(session, ref, "both", 7), 0U);        // any other code means outputs
  platform.take();
  EXPECT_EQ(QorVIO_undefineName(session, ref, "both", syncIn), failed);
  EXPECT_THAT(platform.take(),
              locked("The name, both, has not been defined. Note: Signal names are case-insensitive"));
  EXPECT_EQ(QorVIO_undefineName(session, ref, "", syncIn), failed);
  EXPECT_THAT(platform.take(), locked("Invalid signal name."));
  EXPECT_THAT(sizes({"async_in_data", "both", "sync_in_data"}, 0), ElementsAre(4, 99, 99));
  EXPECT_EQ(code, failed);
  EXPECT_THAT(platform.take(), locked("Could not find a signal with the name: both"));
}

TEST_F(Registry, ReservedNamesCanBeReplacedAndAreNoneOfAPortWithoutBits) {
  EXPECT_EQ(QorVIO_undefineName(session, ref, "sync_in_data", syncIn), 0U);
  EXPECT_EQ(define("sync_in_data", syncIn, {2, 2, 0, 1}), 0U);
  EXPECT_THAT(sizes({"sync_in_data"}, 0), ElementsAre(4));
  initCore(0, 0, 0, 0);
  for (auto [name, isOutput] : {std::pair{"async_in_data", 0U},
                                {"sync_in_data", 0U},
                                {"async_out_data", 1U},
                                {"sync_out_data", 1U}}) {
    sizes({name}, isOutput);
    EXPECT_EQ(code, failed);
  }
}

TEST_F(Registry, NamesAreToldApartByLengthAndByte) {
  std::vector<unsigned> bits{0};
  const std::string odd[] = {
      "a", std::string("a\0", 2), std::string("a\0b", 3), "[", "{", "\xC4", "\xE4", "@", "`"};
  for (const std::string& name : odd) core().defineSignal(name, asyncOut, bits);
  for (const std::string& name : odd) core().undefineSignal(name, asyncOut);
  EXPECT_THROW(core().undefineSignal("a", asyncOut), std::logic_error);
}

TEST_F(Registry, AssigningACoreDuplicatesItsNamesOntoItsOwnImage) {
  EXPECT_EQ(define("led", asyncOut, {3}), 0U);
  EXPECT_EQ(define("key", asyncIn, {2}), 0U);
  const unsigned char word[154] = {};
  QorRT::QorVIO_Core twin(session, ref, {0, 9, 0, 0, 0}, word, sizeof word * 8);
  twin = core();
  EXPECT_EQ(QorVIO_terminateCore(session, ref), 0U);
  platform.take();
  TextMap map{{"LED", "1"}};
  twin.writeValues(session, ref, &map);
  EXPECT_EQ(writtenDigits(8 + 160 + 8 + 10).substr(0, 8), "00010000");
  twin.addSignal(nullptr);
  twin.removeSignal(nullptr);
  platform.readDigits =
      "0000"
      "0000"
      "1000"
      "0000" +
      std::string(3 * 6, '0');
  map.clear();
  twin.readValues(session, ref, &map);
  EXPECT_EQ(map["key"], "1");
  EXPECT_EQ(twin.getSignal("led", 0, 0), nullptr);
}

}  // namespace
