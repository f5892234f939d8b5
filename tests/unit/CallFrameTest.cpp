// What every exported function shares: lock, lookup, checks, and failures that become messages.
#include <pthread.h>

#include <functional>
#include <stdexcept>

#include "tests/unit/VioTest.h"

namespace {

unsigned sizes[] = {99, 99};
const unsigned bit[] = {0};
const char* names[] = {"a", nullptr};
const unsigned char bytes[64] = {};
TextMap* noMap = nullptr;
unsigned char* const none = nullptr;

auto bus(const char* name, const unsigned* bits) {
  return [=] { return QorVIO_defineBus(session, ref, name, 9, bits, 0); };
}
auto getSizes(const char** of, unsigned* to, unsigned count) {
  return [=] { return QorVIO_getSignalSizes(session, ref, of, to, count, 0); };
}
auto set(const unsigned char* av, const unsigned char* am, unsigned a, const unsigned char* ss,
         const unsigned char* sm, unsigned s) {
  return [=] { return QorVIO_setPortBits(session, ref, av, am, a, ss, sm, s); };
}
auto get(unsigned a, unsigned s) {
  return
      [=] { return QorVIO_getPortBits(session, ref, none, none, none, a, none, none, none, none, none, s); };
}
std::string fits(const std::string& count, const std::string& type) {
  return "(" + count + " == core->getCorePhysicalSignalCount(Qor_SignalBase::SIGNAL_TYPE_VIO_" + type +
         ")) || (" + count + " == 0)";
}

const struct {
  std::function<unsigned()> call;
  std::string function, failedCheck;
} failingChecks[] = {
    {[] { return QorVIO_defineSignal(session, ref, nullptr, 9, 9); }, "defineSignal", "name!=0"},
    {bus(nullptr, nullptr), "defineBus", "name!=0"},
    {bus("b", nullptr), "defineBus", "bitIndexArray!=0"},
    {bus("b", bit), "defineBus", "arrayLen!=0"},
    {[] { return QorVIO_undefineName(session, ref, nullptr, 0); }, "undefineName", "name!=0"},
    {getSizes(nullptr, nullptr, 0), "getSignalSizes", "nameArray!=0"},
    {getSizes(names, nullptr, 0), "getSignalSizes", "sizeArray!=0"},
    {getSizes(names, sizes, 0), "getSignalSizes", "arrayLen!=0"},
    {getSizes(names, sizes, 2), "getSignalSizes", "nameArray[i]!=0"},
    {[] { return QorVIO_writeValues(session, ref, nullptr); }, "writeValues", "outputHashMap!=0"},
    {[] { return QorVIO_writeValues(session, ref, &noMap); }, "writeValues", "*outputHashMap!=0"},
    {[] { return QorVIO_readValues(session, ref, nullptr); }, "readValues", "inputHashMap!=0"},
    {[] { return QorVIO_readValues(session, ref, &noMap); }, "readValues", "*inputHashMap!=0"},
    {set(none, none, 7, none, none, 7), "setPortBits", fits("asyncOutDataBitCount", "ASYNC_OUTPUT")},
    {set(none, none, 8, none, none, 7), "setPortBits", fits("syncOutDataBitCount", "SYNC_OUTPUT")},
    {set(none, bytes, 8, bytes, bytes, 10), "setPortBits", "asyncOutValueBits!=0"},
    {set(bytes, none, 8, bytes, bytes, 10), "setPortBits", "asyncOutMaskBits!=0"},
    {set(bytes, bytes, 8, none, bytes, 10), "setPortBits", "syncOutStepBits!=0"},
    {set(bytes, bytes, 8, bytes, none, 10), "setPortBits", "syncOutMaskBits!=0"},
    {get(5, 5), "getPortBits", fits("asyncInDataBitCount", "ASYNC_INPUT")},
    {get(4, 5), "getPortBits", fits("syncInDataBitCount", "SYNC_INPUT")},
};

TEST_F(VioTest, ArgumentChecksComeAfterTheLookupUnderTheLockAndSendNothing) {
  for (const bool isThere : {false, true}) {
    if (isThere) initCore(4, 3, 8, 10);
    for (const auto& [call, function, check] : failingChecks) {
      EXPECT_EQ(call(), failed);
      EXPECT_THAT(platform.take(),
                  locked(isThere ? "QorVIO_" + function + "() arg. failed:" + check : lookupFailed));
    }
  }
  EXPECT_THAT(sizes, testing::Each(99U));
}

TEST_F(VioTest, InformationChecksTheRecordBeforeTheLockAndTheResultAfterIt) {
  TextMap* map = nullptr;
  EXPECT_EQ(QorVIO_getInfo(session, ref, nullptr), failed);
  EXPECT_EQ(QorVIO_getCoreInfo(session, ref, nullptr), failed);
  EXPECT_EQ(QorVIO_getCoreInfo(session, ref, &map), failed);
  EXPECT_EQ(QorVIO_isVIOCore(session, ref, nullptr), failed);
  EXPECT_THAT(
      platform.take(),
      ElementsAre("message 100 Arg. to function QorVIO_getCoreInfo() failed:coreInfo!=0",
                  "message 100 Arg. to function QorVIO_getCoreInfo() failed:coreInfo!=0",
                  "message 100 Arg. to function QorVIO_getCoreInfo() failed:*coreInfo!=0", "lock 7 60000",
                  "unlock 7", "message 100 QorVIO_isVIOCore() arg. failed:result!=0"));
}

TEST_F(VioTest, WhateverIsThrownBelowBecomesOneMessageAfterTheLock) {
  initCore(4, 3, 8, 10);
  const std::pair<std::function<void()>, const char*> failures[] = {
      {[] { throw std::runtime_error("TDO is all zeros"); }, "message 100 TDO is all zeros"},
      {[] { throw std::bad_alloc(); }, "message 100 std::bad_alloc"},
      {[] { throw std::runtime_error("Qor abort command"); }, "message 8000 Qor abort command"},
      {[] { throw std::runtime_error("Qor abort command."); }, "message 100 Qor abort command."},
      {[] { throw 3; }, "message 100 Qor internal error."},
  };
  for (const auto& [failure, message] : failures) {
    platform.before["flush"] = failure;
    EXPECT_EQ(write({{"async_out_data", "1"}}), failed);
    EXPECT_THAT(platform.take(),
                ElementsAre("lock 7 60000", testing::StartsWith("sequence"), "flush 7", "unlock 7", message));
  }
  platform.before["lock"] = [] { throw std::logic_error("unknown session 7"); };
  EXPECT_EQ(write({}), failed);
  EXPECT_THAT(platform.take(), ElementsAre("lock 7 60000", "message 100 unknown session 7"));
}

void* callRead(void* read) {
  (*static_cast<std::function<void()>*>(read))();
  return nullptr;
}

TEST_F(VioTest, ACancelledThreadEndsAndFreesTheLock) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "AddressSanitizer aborts when a cancelled thread unwinds";
#endif
  initCore(4, 3, 8, 10);
  std::function<void()> call = [this] { read(); };
  for (const char* place : {"sequence", "message"}) {
    platform.before[place] = [] {
      pthread_cancel(pthread_self());
      pthread_testcancel();
    };
    pthread_t thread;
    ASSERT_EQ(pthread_create(&thread, nullptr, callRead, &call), 0);
    void* result = nullptr;
    pthread_join(thread, &result);
    EXPECT_EQ(result, PTHREAD_CANCELED);
    EXPECT_EQ(platform.take().at(2), "unlock 7");
    platform.before[place] = [] { throw std::runtime_error("link"); };
  }
}

TEST_F(VioTest, AFailedReadLeavesTheMapAndAMessageSinkThatThrowsLetsNothingOut) {
  initCore(4, 3, 8, 10);
  platform.before["sequence"] = [] { throw std::runtime_error("link"); };
  platform.before["message"] = [] { throw std::runtime_error("full"); };
  TextMap map{{"async_in_data", "mine"}};
  TextMap* pointer = &map;
  EXPECT_EQ(QorVIO_readValues(session, ref, &pointer), failed);
  EXPECT_EQ(map, (TextMap{{"async_in_data", "mine"}}));
  platform.info.core_type = 7;
  EXPECT_EQ(QorVIO_initCore(session, ref), failed);
}

}  // namespace
