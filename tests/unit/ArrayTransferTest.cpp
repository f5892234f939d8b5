// Values by name, as bytes, several samples a call; and the groups underneath.
#include <algorithm>
#include <stdexcept>

#include "QorVIO_Signal.h"
#include "VioTest.h"

namespace {

using Bytes = std::vector<unsigned char>;

/// The text of the logic_error that a call throws.
template <class Call>
std::string failureOf(const Call& call) {
  try {
    call();
  } catch (const std::logic_error& e) {
    return e.what();
  }
  return "nothing thrown";
}

class Arrays : public VioTest {
 protected:
  Arrays() {
    initCore(9, 2, 3, 4);
    EXPECT_EQ(define("leds", asyncOut, {0, 1, 2}), 0U);
    EXPECT_EQ(define("train", syncOut, {0, 3}), 0U);
    siblings.take();
  }

  void writeArray(std::vector<std::string> names, std::vector<const unsigned char*> values,
                  std::vector<unsigned> sizes, unsigned samples, unsigned burst) {
    core().writeValues(session, ref, std::move(names), values.data(), sizes.data(),
                       static_cast<unsigned>(values.size()), samples, burst);
  }

  std::size_t writesSent() {
    auto calls = siblings.take();
    return static_cast<std::size_t>(std::count_if(
        calls.begin(), calls.end(), [](const std::string& c) { return c.rfind("sequence", 0) == 0; }));
  }

  Bytes ones = Bytes(40, 1);
};

TEST_F(Arrays, WritesOneSampleAnExchangeAndSixteenInABurst) {
  for (auto [count, burst, expected] :
       {std::array{20U, 1U, 2U}, {20U, 2U, 20U}, {16U, 1U, 1U}, {17U, 1U, 2U}, {0U, 1U, 0U}, {3U, 0U, 3U}}) {
    writeArray({"train"}, {ones.data()}, {40}, count, burst);
    EXPECT_EQ(writesSent(), expected) << count << " samples, burst " << burst;
  }
  core().writeValues(session, ref, {}, nullptr, nullptr, 0, 2, 0);
  EXPECT_EQ(writesSent(), 2U);
}

TEST_F(Arrays, ALastShortBurstHoldsItsLastSample) {
  Bytes values(19, 0);
  values[16] = 1;
  values[17] = 2;
  values[18] = 3;
  std::string last;
  siblings.before["flush"] = [&] { last = siblings.calls[siblings.calls.size() - 2]; };
  writeArray({"train"}, {values.data()}, {19}, 19, 1);
  siblings.calls = {last};
  std::string all = writtenDigits(3 + 64 + 3 + 4);
  EXPECT_EQ(all.substr(3, 16), "1011111111111111");
  EXPECT_EQ(all.substr(3 + 48, 16), "0111111111111111");
  EXPECT_EQ(all.substr(3 + 64),
            "000"
            "1001");
}

TEST_F(Arrays, WriteChecksEverythingBeforeItStages) {
  const unsigned char* bytes = ones.data();
  EXPECT_EQ(failureOf([&] {
              writeArray({"leds", "who.value"}, {bytes, bytes}, {40, 40}, 1, 0);
            }),
            "Could not find a signal with the name: who.value");
  EXPECT_EQ(failureOf([&] { writeArray({"leds"}, {bytes}, {0}, 1, 1); }),
            "Burst mode cannot be used with the non-synchronous output: leds");
  EXPECT_EQ(failureOf([&] { writeArray({"leds"}, {nullptr}, {2}, 3, 0); }),
            "The size of the value is not large enough for the signal: leds");
  EXPECT_EQ(failureOf([&] { writeArray({"train"}, {bytes}, {0xFFFFFFFE}, 0xFFFFFFFF, 1); }),
            "The size of the value is not large enough for the signal: train");
  EXPECT_EQ(failureOf([&] { writeArray({"leds"}, {nullptr}, {3}, 3, 0); }),
            "Invalid values for signal: leds");
  EXPECT_EQ(failureOf([&] { writeArray({}, {bytes}, {3}, 3, 0); }),
            "The list of names is shorter than the count.");
  unsigned size = 3;
  EXPECT_EQ(failureOf([&] { core().writeValues(session, ref, {"leds"}, nullptr, &size, 1, 3, 0); }),
            "The array of values is null.");
  EXPECT_EQ(failureOf([&] { core().writeValues(session, ref, {"leds"}, &bytes, nullptr, 1, 3, 0); }),
            "The array of sizes is null.");
  EXPECT_EQ(writesSent(), 0U);
  EXPECT_EQ(write({}), 0U);
  EXPECT_EQ(writtenDigits(74), std::string(74, '0'));
}

TEST_F(Arrays, ReadsEachSampleToItsPlace) {
  unsigned round = 0;
  siblings.before["sequence"] = [&] {
    siblings.readDigits.assign(4 * 9 + 6 * 2, '0');
    siblings.readDigits[4 * round] = '1';                 // value of async input `round`
    siblings.readDigits[4 * (8 - round) + 1] = '1';       // activity up of the bits from the top
    siblings.readDigits[36 + 6 * (round % 2) + 4] = '1';  // sync activity down
    ++round;
  };
  Bytes value(6), up(6), syncDown(3);
  unsigned char* values[] = {value.data(), nullptr};
  unsigned char* ups[] = {up.data(), nullptr};
  unsigned char* syncDowns[] = {nullptr, syncDown.data()};
  unsigned sizes[] = {6, 3};
  core().readValues(session, ref, {"async_in_data", "sync_in_data"}, values, ups, nullptr, nullptr, syncDowns,
                    sizes, 2, 3);
  EXPECT_EQ(value, (Bytes{1, 0, 2, 0, 4, 0}));
  EXPECT_EQ(up, (Bytes{0, 1, 0x80, 0, 0x40, 0}));
  EXPECT_EQ(syncDown, (Bytes{1, 2, 1}));
  EXPECT_EQ(writesSent(), 3U);
  EXPECT_THAT(sizes, ElementsAre(6, 3));
}

TEST_F(Arrays, ReadChecksEverythingBeforeItReads) {
  auto readArray = [&](std::vector<std::string> names, unsigned* sizes) {
    core().readValues(session, ref, std::move(names), nullptr, nullptr, nullptr, nullptr, nullptr, sizes, 1,
                      2);
  };
  unsigned size = 3;
  EXPECT_EQ(failureOf([&] { readArray({"async_in_data"}, &size); }),
            "The size of the value is not large enough for the signal: async_in_data");
  EXPECT_EQ(failureOf([&] { readArray({"leds"}, &size); }), "Could not find a signal with the name: leds");
  EXPECT_EQ(failureOf([&] { readArray({"sync_in_data"}, nullptr); }), "The array of sizes is null.");
  EXPECT_EQ(failureOf([&] { readArray({}, &size); }), "The list of names is shorter than the count.");
  EXPECT_EQ(writesSent(), 0U);
  readArray({"sync_in_data"}, &size);
  EXPECT_EQ(writesSent(), 2U);
}

/// A group on an image of its own, as clients may build one.
class Group : public testing::Test {
 protected:
  Group() {
    QORVIO_CORE_INFO info{};
    info.async_input_count = info.async_output_count = 12;
    info.sync_input_count = info.sync_output_count = 8;
    image.initFromCoreInfo(info);
  }

  QorRT::QorVIO_SignalGroup group(unsigned type, std::vector<unsigned> positions) {
    return {&image, type, positions, "g", "g"};
  }

  QorRT::QorVIO_Command image;
  const Bytes ones = Bytes(64, 0xFF);
};

using QorRT::Qor_SignalBase;

TEST_F(Group, AsksForTheBytesOfWhatItStages) {
  const char* tooSmall = "The size of the value is not large enough for the signal: g";
  auto async = group(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_OUTPUT, {0, 1, 2, 3, 4, 5, 6, 7, 8});
  auto sync = group(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT, {5, 2, 7});
  auto in = group(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT, {0, 1, 2, 3, 4, 5, 6, 7, 0});
  EXPECT_EQ(failureOf([&] { async.setValues(nullptr, 9, 1); }), "Null value for signal: g");
  EXPECT_EQ(failureOf([&] { async.setValues(ones.data(), 1, 5); }), tooSmall);
  EXPECT_EQ(failureOf([&] { sync.setValues(ones.data(), 19, 20); }), tooSmall);
  EXPECT_EQ(failureOf([&] { sync.setValues(ones.data(), 0, 0); }), tooSmall);
  EXPECT_EQ(failureOf([&] { in.getValues(nullptr, nullptr, nullptr, nullptr, nullptr, 1); }), tooSmall);
  std::string text;
  EXPECT_EQ(image.buildCommandText({0, 1, 0}, 1, text, nullptr),
            "00 1 0 01 0 000000A1 " + std::string(40, '0'));
  async.setValues(ones.data(), 2, 5);
  sync.setValues(ones.data(), 20, 20);
  sync.setValues(ones.data(), 1, 0);
  EXPECT_EQ(sync.getType() & Qor_SignalBase::SIGNAL_TYPE_GROUP, Qor_SignalBase::SIGNAL_TYPE_GROUP);
}

TEST_F(Group, CopiesShareTheImageAndTheName) {
  auto original = group(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT, {5, 2, 7});
  QorRT::QorVIO_SignalGroup copy(original);
  auto assigned = group(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT, {0});
  assigned = original;
  const auto& self = assigned;
  assigned = self;
  for (const auto* g : {&copy, &assigned}) {
    EXPECT_EQ(g->getCommand(), &image);
    EXPECT_EQ(g->getKeyName(), "g");
    EXPECT_THAT(g->getPositionVector(), ElementsAre(5, 2, 7));
    EXPECT_EQ(g->size(), 3U);
  }
}

TEST(Signal, StartsWithItsDefaultProperties) {
  for (const char* name : {"led", ""}) {
    QorRT::QorVIO_Signal signal(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT, 0, 3, name);
    EXPECT_EQ(signal.getProperty("format"), std::string(name) + ":%b %a'");
    EXPECT_EQ(signal.getProperty("reset_value"), "0");
    EXPECT_EQ(signal.getProperty("low_value"), "0");
    EXPECT_EQ(signal.getProperty("high_value"), "1");
    const QorRT::QorVIO_Signal copy(signal);  // NOLINT(performance-unnecessary-copy-initialization)
    EXPECT_EQ(copy.getProperty("high_value"), "1");
  }
}

}  // namespace
