// Setting a core up, replacing it, removing it.
#include <stdexcept>

#include "tests/unit/VioTest.h"

namespace {

/// A core of another library.
class OtherCore : public QorRT::Qor_Core {
 public:
  explicit OtherCore(unsigned type) : Qor_Core(session, ref, {0, type, 0, 0, 0}, nullptr, 0) {}
  bool initFromStatusWord(unsigned) override { return true; }
};

TEST_F(VioTest, InitReplacesTheCoreAndItsNamesAndTerminateRemovesItWithoutTheLock) {
  initCore(4, 3, 8, 10);
  EXPECT_EQ(define("led", asyncOut, {0}), 0U);
  platform.take();
  EXPECT_EQ(QorVIO_initCore(session, ref), 0U);
  EXPECT_THAT(platform.take(),
              ElementsAre("lock 7 60000", "remove 0.1.0", "status 0.1.0 1232", "add 0.1.0", "unlock 7"));
  EXPECT_EQ(write({{"led", "1"}}), failed);
  EXPECT_THAT(platform.take(), locked("Could not find a signal with the name: led"));
  EXPECT_EQ(QorVIO_terminateCore(session, ref), 0U);
  EXPECT_EQ(QorVIO_terminateCore(session, ref), 0U);
  EXPECT_THAT(platform.take(), ElementsAre("remove 0.1.0"));
}

TEST_F(VioTest, FailedInitLeavesNothingRegistered) {
  initCore(4, 3, 8, 10);
  platform.info.core_type = 7;
  EXPECT_EQ(QorVIO_initCore(session, ref), failed);
  EXPECT_THAT(platform.take(),
              ElementsAre("lock 7 60000", "remove 0.1.0", "status 0.1.0 1232",
                          "message 100 QorVIO_initCore() for the wrong core type or non-existant core.",
                          "unlock 7", "message 8000 Qor abort command"));
  EXPECT_TRUE(platform.cores.empty());

  platform.info.core_type = 9;
  platform.before["add"] = [] { throw std::runtime_error("no room"); };
  EXPECT_EQ(QorVIO_initCore(session, ref), failed);  // the core object is freed: the sanitizer looks
  EXPECT_EQ(platform.take().back(), "message 100 no room");
  EXPECT_TRUE(platform.cores.empty());
}

TEST_F(VioTest, ACoreOfAnotherLibraryIsReplacedByInitOnly) {
  platform.cores["0.1.0"] = std::make_unique<OtherCore>(9);  // of the type, but not of the class
  EXPECT_EQ(write({}), failed);
  EXPECT_THAT(platform.take(), locked(lookupFailed));
  const unsigned char word[154] = {};
  const QOR_CORE_INFO otherType{0, 7, 0, 0, 0};  // and the other way round
  platform.cores["0.1.0"] =
      std::make_unique<QorRT::QorVIO_Core>(session, ref, otherType, word, sizeof word * 8);
  EXPECT_EQ(write({}), failed);
  EXPECT_THAT(platform.take(), locked(lookupFailed));
  platform.cores["0.1.0"] = std::make_unique<OtherCore>(7);
  EXPECT_EQ(QorVIO_terminateCore(session, ref), 0U);
  EXPECT_TRUE(platform.take().empty());
  EXPECT_EQ(write({}), failed);
  EXPECT_THAT(platform.take(), locked(lookupFailed));
  EXPECT_EQ(QorVIO_initCore(session, ref), failed);
  EXPECT_THAT(platform.take(), testing::Contains("remove 0.1.0"));
}

TEST_F(VioTest, AddressesInMessagesArePlainDecimal) {
  EXPECT_EQ(QorVIO_undefineName(session, {1000, 2, 34567}, "x", 0), failed);
  EXPECT_THAT(platform.take(), locked("Data structures not initialized for VIO core Device:1000, user chain "
                                      "number:2, core index:34567."));
}

}  // namespace
