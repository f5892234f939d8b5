// Values by name, as bytes, several samples per call; and the groups underneath.
#include <functional>
#include <stdexcept>

#include "QorUtil.h"
#include "QorVIO_Signal.h"
#include "tests/unit/VioTest.h"

namespace {

using Bytes = std::vector<unsigned char>;
using Names = std::vector<std::string>;
using QorRT::Qor_SignalBase;

/// The text of the logic_error that a call throws.
std::string failureOf(const std::function<void()>& call) {
  try {
    call();
  } catch (const std::logic_error& e) {
    return e.what();
  }
  return "nothing thrown";
}

const Bytes ones(64, 0xFF);
const std::string tooSmall = "The size of the value is not large enough for the signal: ";

class Arrays : public VioTest {
 protected:
  Arrays() {
    initCore(9, 2, 3, 4);
    EXPECT_EQ(define("leds", asyncOut, {0, 1, 2}), 0U);
    EXPECT_EQ(define("train", syncOut, {0, 3}), 0U);
    platform.take();
  }
};

TEST_F(Arrays, AreCheckedBeforeAnythingIsStagedOrSent) {
  auto write = [&](const Names& names, const unsigned char* value, unsigned size, unsigned samples,
                   unsigned burst) {
    return failureOf([=] {
      const unsigned char* values[] = {ones.data(), value};
      unsigned sizes[] = {64, size};
      core().writeValues(session, ref, names, values, sizes, 2, samples, burst);
    });
  };
  const unsigned char* bytes = ones.data();
  EXPECT_EQ(write({"leds", "who.value"}, bytes, 64, 1, 0),
            "Could not find a signal with the name: who.value");
  EXPECT_EQ(write({"train", "leds"}, bytes, 0, 1, 1),
            "Burst mode cannot be used with the non-synchronous output: leds");
  EXPECT_EQ(write({"leds", "leds"}, nullptr, 2, 3, 0), tooSmall + "leds");
  EXPECT_EQ(write({"leds", "leds"}, nullptr, 3, 3, 0), "Invalid values for signal: leds");
  EXPECT_EQ(write({"leds"}, bytes, 3, 3, 0), "The list of names is shorter than the count.");

  auto read = [&](const Names& names, unsigned* sizes) {
    return failureOf([=] {
      core().readValues(session, ref, names, nullptr, nullptr, nullptr, nullptr, nullptr, sizes, 1, 2);
    });
  };
  const char* noSizes = "The array of sizes is null.";
  unsigned size = 3;
  EXPECT_EQ(read({"async_in_data"}, &size), tooSmall + "async_in_data");
  EXPECT_EQ(read({"leds"}, &size), "Could not find a signal with the name: leds");
  EXPECT_EQ(read({"sync_in_data"}, nullptr), noSizes);
  EXPECT_EQ(failureOf([&] {
              core().readValues(session, ref, {"async_in_data"}, nullptr, nullptr, nullptr, nullptr, nullptr,
                                &size, 1, 0x80000000);
            }),
            tooSmall + "async_in_data");
  EXPECT_EQ(read({}, &size), "The list of names is shorter than the count.");

  EXPECT_EQ(failureOf([&] { core().writeValues(session, ref, {"leds"}, nullptr, &size, 1, 3, 0); }),
            "The array of values is null.");
  EXPECT_EQ(failureOf([&] { core().writeValues(session, ref, {"leds"}, &bytes, nullptr, 1, 3, 0); }),
            noSizes);
  EXPECT_THAT(platform.take(), ElementsAre());
}

TEST_F(Arrays, AreWrittenInBurstsOfSixteen) {
  const auto written = [](const std::string& first, const std::string& second) {
    std::string hex;
    QorRT::Qor_NumberUtil::binStr2HexStr("000" + first + std::string(32, '0') + second + "0001001", hex);
    return "sequence 00 1 0 01 0 0000004B " + hex + "\n00 1 0 02 0 00000004 0";
  };
  Bytes samples(20);
  for (unsigned i = 0; i < 20; ++i) samples[i] = static_cast<unsigned char>(i % 3);
  const unsigned char* values[] = {samples.data()};
  unsigned sizes[] = {20};
  core().writeValues(session, ref, {"train"}, values, sizes, 1, 20, 1);
  EXPECT_THAT(platform.take(), ElementsAre(written("0100100100100100", "0010010010010010"), "flush 7",
                                           written("1001111111111111", "0100000000000000"), "flush 7"));
  core().writeValues(session, ref, {"train"}, values, sizes, 1, 20, 2);
  EXPECT_EQ(platform.take().size(), 40U);
  core().writeValues(session, ref, {"train"}, values, sizes, 1, 0, 0);
  EXPECT_THAT(platform.take(), ElementsAre());
  core().writeValues(session, ref, {}, nullptr, nullptr, 0, 1, 0);
  EXPECT_EQ(writtenDigits(74).substr(67), "0000000");  // the masks
}

TEST_F(Arrays, OfAReadMayHoldNullBuffers) {
  platform.readDigits = "1010" + std::string(4 * 8, '0') + "000000" + "110010";
  Bytes value(4), syncUp(2);
  unsigned char* values[] = {value.data(), nullptr};
  unsigned char* syncUps[] = {nullptr, syncUp.data()};
  unsigned sizes[] = {4, 2};
  core().readValues(session, ref, {"async_in_data", "sync_in_data"}, values, nullptr, nullptr, nullptr,
                    syncUps, sizes, 2, 2);
  EXPECT_EQ(value, (Bytes{1, 0, 1, 0}));
  EXPECT_EQ(syncUp, (Bytes{2, 2}));
  EXPECT_THAT(sizes, ElementsAre(4, 2));
}

/// A group on an image of its own, as clients may build one.
class Group : public testing::Test {
 protected:
  Group() {
    QORVIO_CORE_INFO info{};
    info.async_output_count = 12;
    info.sync_input_count = info.sync_output_count = 8;
    image.initFromCoreInfo(info);
  }

  QorRT::QorVIO_SignalGroup group(unsigned type, std::vector<unsigned> positions) {
    return {&image, type, positions, "g", "g"};
  }

  QorRT::QorVIO_Command image;
  QorRT::QorVIO_SignalGroup sync = group(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT, {5, 2, 7});
};

TEST_F(Group, AsksForTheBytesOfWhatItStages) {
  auto async = group(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_OUTPUT, {0, 1, 2, 3, 4, 5, 6, 7, 8});
  auto in = group(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT, {0, 1, 2, 3, 4, 5, 6, 7, 0});
  EXPECT_EQ(failureOf([&] { async.setValues(nullptr, 9, 1); }), "Null value for signal: g");
  EXPECT_EQ(failureOf([&] { async.setValues(ones.data(), 1, 5); }), tooSmall + "g");
  EXPECT_EQ(failureOf([&] { sync.setValues(ones.data(), 19, 20); }), tooSmall + "g");
  EXPECT_EQ(failureOf([&] { sync.setValues(ones.data(), 0, 0); }), tooSmall + "g");
  EXPECT_EQ(failureOf([&] { in.getValues(nullptr, nullptr, nullptr, nullptr, nullptr, 1); }), tooSmall + "g");
  std::string text;
  EXPECT_EQ(image.buildCommandText({0, 1, 0}, 1, text, nullptr),
            "00 1 0 01 0 000000A1 " + std::string(40, '0'));
  EXPECT_EQ(image.buildCommandText({0, 1, 0}, 5, text, nullptr), "");
  EXPECT_EQ(image.buildCommandText({0x12, 3, 4}, 2, text, nullptr), "12 3 4 02 0 00000004 0");
  async.setValues(ones.data(), 2, 5);
  sync.setValues(ones.data(), 20, 20);
  sync.setValues(ones.data(), 1, 0);
}

/// Values, activity up and down, and of the synchronous input its two clocked activities.
std::vector<std::string> inputsOf(const QorRT::QorVIO_Command& c) {
  return {c.getAsyncInValues(),        c.getAsyncInActivityUp(),     c.getAsyncInActivityDown(),
          c.getSyncInValues(),         c.getSyncInActivityUp(),      c.getSyncInActivityDown(),
          c.getSyncInSyncActivityUp(), c.getSyncInSyncActivityDown()};
}

TEST_F(VioTest, AnImageIsAssignedWholly) {
  QORVIO_CORE_INFO info{};
  info.async_input_count = info.sync_input_count = info.async_output_count = info.sync_output_count = 1;
  QorRT::QorVIO_Command image, copy;
  image.initFromCoreInfo(info);
  image.setAsyncOutValueBit(0, '1');
  image.setSyncOutPulseTrainBit(0, 15, '1');
  image.setAsyncOutMaskBit(0, '1');
  image.setSyncOutMaskBit(0, '1');
  platform.readDigits = "1110111110";
  image.readInputs(session, ref);
  image.setKeepsActivity(true);
  copy = image;
  EXPECT_EQ(inputsOf(copy), std::vector<std::string>(8, "1"));
  std::string text;
  EXPECT_EQ(copy.buildCommandText(ref, 1, text, nullptr), "00 1 0 01 0 00000014 40007");
  platform.readDigits = "0000000000";
  copy.readInputs(session, ref);
  EXPECT_THAT(inputsOf(copy), ElementsAre("0", "1", "1", "0", "1", "1", "1", "1"));
}

TEST_F(Group, CopiesShareTheImageAndTheName) {
  QorRT::QorVIO_SignalGroup copy(sync);
  QorRT::QorVIO_Command other;
  std::vector<unsigned> positions{0};
  QorRT::QorVIO_SignalGroup assigned(&other, Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT, positions, "h", "h");
  assigned = sync;
  const auto& self = assigned;
  assigned = self;
  for (const auto* g : {&copy, &assigned}) {
    EXPECT_EQ(g->getCommand(), &image);
    EXPECT_EQ(g->getKeyName(), "g");
    EXPECT_EQ(g->getType(), Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT | Qor_SignalBase::SIGNAL_TYPE_GROUP);
    EXPECT_THAT(g->getPositionVector(), ElementsAre(5, 2, 7));
  }
}

TEST(Signal, StartsWithItsDefaultProperties) {
  const QorRT::QorVIO_Signal signal(Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT, 0, 3, "led");
  QorRT::QorVIO_Signal copy(Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT, 0, 0, "other");
  copy = QorRT::QorVIO_Signal(signal);
  EXPECT_EQ(copy.getProperty("format"), "led:%b %a'");
  EXPECT_EQ(copy.getProperty("reset_value"), "0");
  EXPECT_EQ(copy.getProperty("low_value"), "0");
  EXPECT_EQ(copy.getProperty("high_value"), "1");
}

}  // namespace
