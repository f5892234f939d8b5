// What every exported function shares: lock, lookup, checks, and failures that become messages.
#include <functional>
#include <stdexcept>

#include "VioTest.h"

namespace {

TextMap* const noMap = nullptr;

struct Case {
  const char* name;
  std::function<unsigned()> call;
  const char* message;  // of the failed argument check
};

void PrintTo(const Case& c, std::ostream* out) {
  *out << c.name << ": " << c.message;
}

const unsigned oneBit[] = {0};
const char* const noName = nullptr;
const char* names[] = {"a", noName};
unsigned sizes[] = {99, 99};
const unsigned char bytes[64] = {};

std::vector<Case> failingChecks() {
  auto noMapVariable = [](auto function) { return [=] { return function(session, ref, nullptr); }; };
  auto nullMap = [](auto function) {
    return [=] {
      TextMap* map = noMap;
      return function(session, ref, &map);
    };
  };
  auto setPorts = [](const unsigned char* av, const unsigned char* am, unsigned a, const unsigned char* ss,
                     const unsigned char* sm, unsigned s) {
    return [=] { return QorVIO_setPortBits(session, ref, av, am, a, ss, sm, s); };
  };
  auto getPorts = [](unsigned a, unsigned s) {
    return [=] {
      return QorVIO_getPortBits(session, ref, nullptr, nullptr, nullptr, a, nullptr, nullptr, nullptr,
                                nullptr, nullptr, s);
    };
  };
  return {
      {"signal", [] { return QorVIO_defineSignal(session, ref, noName, 9, 9); },
       "QorVIO_defineSignal() arg. failed:name!=0"},
      {"bus", [] { return QorVIO_defineBus(session, ref, noName, 9, nullptr, 0); },
       "QorVIO_defineBus() arg. failed:name!=0"},
      {"bus", [] { return QorVIO_defineBus(session, ref, "b", 0, nullptr, 0); },
       "QorVIO_defineBus() arg. failed:bitIndexArray!=0"},
      {"bus", [] { return QorVIO_defineBus(session, ref, "b", 0, oneBit, 0); },
       "QorVIO_defineBus() arg. failed:arrayLen!=0"},
      {"undefine", [] { return QorVIO_undefineName(session, ref, noName, 0); },
       "QorVIO_undefineName() arg. failed:name!=0"},
      {"sizes", [] { return QorVIO_getSignalSizes(session, ref, nullptr, nullptr, 0, 0); },
       "QorVIO_getSignalSizes() arg. failed:nameArray!=0"},
      {"sizes", [] { return QorVIO_getSignalSizes(session, ref, names, nullptr, 0, 0); },
       "QorVIO_getSignalSizes() arg. failed:sizeArray!=0"},
      {"sizes", [] { return QorVIO_getSignalSizes(session, ref, names, sizes, 0, 0); },
       "QorVIO_getSignalSizes() arg. failed:arrayLen!=0"},
      {"sizes", [] { return QorVIO_getSignalSizes(session, ref, names, sizes, 2, 0); },
       "QorVIO_getSignalSizes() arg. failed:nameArray[i]!=0"},
      {"write", noMapVariable(QorVIO_writeValues), "QorVIO_writeValues() arg. failed:outputHashMap!=0"},
      {"write", nullMap(QorVIO_writeValues), "QorVIO_writeValues() arg. failed:*outputHashMap!=0"},
      {"read", noMapVariable(QorVIO_readValues), "QorVIO_readValues() arg. failed:inputHashMap!=0"},
      {"read", nullMap(QorVIO_readValues), "QorVIO_readValues() arg. failed:*inputHashMap!=0"},
      {"set", setPorts(nullptr, nullptr, 7, nullptr, nullptr, 7),
       "QorVIO_setPortBits() arg. failed:(asyncOutDataBitCount == core->getCorePhysicalSignalCount("
       "Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_OUTPUT)) || (asyncOutDataBitCount == 0)"},
      {"set", setPorts(nullptr, nullptr, 8, nullptr, nullptr, 7),
       "QorVIO_setPortBits() arg. failed:(syncOutDataBitCount == core->getCorePhysicalSignalCount("
       "Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_OUTPUT)) || (syncOutDataBitCount == 0)"},
      {"set", setPorts(nullptr, bytes, 8, bytes, bytes, 10),
       "QorVIO_setPortBits() arg. failed:asyncOutValueBits!=0"},
      {"set", setPorts(bytes, nullptr, 8, bytes, bytes, 10),
       "QorVIO_setPortBits() arg. failed:asyncOutMaskBits!=0"},
      {"set", setPorts(bytes, bytes, 8, nullptr, bytes, 10),
       "QorVIO_setPortBits() arg. failed:syncOutStepBits!=0"},
      {"set", setPorts(bytes, bytes, 8, bytes, nullptr, 10),
       "QorVIO_setPortBits() arg. failed:syncOutMaskBits!=0"},
      {"get", getPorts(5, 5),
       "QorVIO_getPortBits() arg. failed:(asyncInDataBitCount == core->getCorePhysicalSignalCount("
       "Qor_SignalBase::SIGNAL_TYPE_VIO_ASYNC_INPUT)) || (asyncInDataBitCount == 0)"},
      {"get", getPorts(4, 5),
       "QorVIO_getPortBits() arg. failed:(syncInDataBitCount == core->getCorePhysicalSignalCount("
       "Qor_SignalBase::SIGNAL_TYPE_VIO_SYNC_INPUT)) || (syncInDataBitCount == 0)"},
  };
}

class ArgumentCheck : public VioTest, public testing::WithParamInterface<Case> {};

TEST_P(ArgumentCheck, FailsUnderTheLockAndSendsNothing) {
  initCore(4, 3, 8, 10);
  EXPECT_EQ(GetParam().call(), failed);
  EXPECT_THAT(siblings.take(), locked(GetParam().message));
  EXPECT_THAT(sizes, testing::Each(99U));
}

TEST_P(ArgumentCheck, ComesAfterTheLookup) {
  EXPECT_EQ(GetParam().call(), failed);
  EXPECT_THAT(
      siblings.take(),
      locked("Data structures not initialized for VIO core Device:0, user chain number:1, core index:0."));
}

INSTANTIATE_TEST_SUITE_P(All, ArgumentCheck, testing::ValuesIn(failingChecks()));

TEST_F(VioTest, InformationChecksTheRecordBeforeTheLockAndTheResultAfterIt) {
  TextMap* map = noMap;
  EXPECT_EQ(QorVIO_getInfo(session, ref, nullptr), failed);
  EXPECT_EQ(QorVIO_getCoreInfo(session, ref, nullptr), failed);
  EXPECT_EQ(QorVIO_getCoreInfo(session, ref, &map), failed);
  EXPECT_EQ(QorVIO_isVIOCore(session, ref, nullptr), failed);
  EXPECT_THAT(
      siblings.take(),
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
    siblings.before["flush"] = failure;
    EXPECT_EQ(write({{"async_out_data", "1"}}), failed);
    EXPECT_THAT(siblings.take(),
                ElementsAre("lock 7 60000", testing::StartsWith("sequence"), "flush 7", "unlock 7", message));
  }
  siblings.before["lock"] = [] { throw std::logic_error("unknown session 7"); };
  EXPECT_EQ(write({}), failed);
  EXPECT_THAT(siblings.take(), ElementsAre("lock 7 60000", "message 100 unknown session 7"));
}

TEST_F(VioTest, AMessageSinkThatThrowsLetsNothingOut) {
  siblings.before["message"] = [] { throw std::runtime_error("full"); };
  EXPECT_EQ(QorVIO_initCore(session, ref), failed);
  EXPECT_EQ(write({}), failed);
}

}  // namespace
