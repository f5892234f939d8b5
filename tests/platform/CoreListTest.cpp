#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "QorCore.h"
#include "tests/platform/ScriptedCable.h"

namespace {

using QorRT::Qor_CoreList;

const unsigned char statusBytes[] = {0x51, 0x09, 0x0A};

class TestCore : public QorRT::Qor_SignalCore {
 public:
  TestCore(unsigned session, QOR_CORE_REF coreRef, std::vector<std::string>& destroyed)
      : Qor_SignalCore(session, coreRef, {0x51, 9, 10, 0, 0}, statusBytes, 17),
        session_(session),
        destroyed_(&destroyed) {}
  ~TestCore() override {
    const bool stillListed = Qor_CoreList::getCore(session_, getCoreRef()) != nullptr;
    destroyed_->push_back(std::to_string(getCoreRef().core_index) + (stillListed ? " listed" : ""));
  }
  TestCore& operator=(const TestCore& other) = default;

  bool initFromStatusWord(unsigned) override { return true; }
  void addSignal(QorRT::Qor_SignalBase*) override {}
  QorRT::Qor_SignalBase* getSignal(const std::string&, unsigned, unsigned) override { return nullptr; }
  void removeSignal(QorRT::Qor_SignalBase*) override {}
  void setCorePhysicalSignalCounts() override { setCorePhysicalSignalCount(3, 17); }
  std::string status() {
    return std::to_string(getStatusWord().getSize()) + " bytes, " + std::to_string(getStatusWord()[2]);
  }

 private:
  unsigned session_;
  std::vector<std::string>* destroyed_;
};

class CoreList : public testing::Test {
 protected:
  QorRT::Qor_Core* add(unsigned index) {
    auto core = std::make_unique<TestCore>(session.handle, QOR_CORE_REF{0, 1, index}, destroyed);
    Qor_CoreList::addCore(session.handle, core.get());
    return core.release();
  }
  QorRT::Qor_Core* get(unsigned index) { return Qor_CoreList::getCore(session.handle, {0, 1, index}); }

  std::vector<std::string> destroyed;
  ScriptedSession session;
};

TEST_F(CoreList, FindsCoresByAddressAndDestroysWhatIsRemoved) {
  QorRT::Qor_Core *first = add(0), *second = add(1);
  EXPECT_EQ(get(0), first);
  EXPECT_EQ(get(1), second);
  EXPECT_EQ(Qor_CoreList::getCore(session.handle + 1, {0, 1, 0}), nullptr);
  QorRT::Qor_Core* gone = first;
  Qor_CoreList::removeCore(session.handle, &first);
  EXPECT_EQ(first, nullptr);
  EXPECT_EQ(get(0), nullptr);
  EXPECT_EQ(destroyed, std::vector<std::string>({"0"}));
  for (auto** core : {&gone, &first, static_cast<QorRT::Qor_Core**>(nullptr)})
    Qor_CoreList::removeCore(session.handle, core);
  EXPECT_EQ(destroyed.size(), 1U);
}

TEST_F(CoreList, OwnsNothingThatItRefuses) {
  const QorRT::Qor_Core* first = add(0);
  EXPECT_EQ(thrownBy([this] { add(0); }),
            "logic: device 0, user chain 1, core 0: there is a core in the list already");
  EXPECT_EQ(destroyed, std::vector<std::string>({"0 listed"}));
  EXPECT_EQ(get(0), first);
  EXPECT_EQ(thrownBy([this] { Qor_CoreList::addCore(session.handle, nullptr); }),
            "logic: the core for the list is null");
  TestCore kept(session.handle, {0, 1, 5}, destroyed);
  EXPECT_EQ(thrownBy([&] { Qor_CoreList::addCore(session.handle + 1, &kept); }),
            "logic: unknown session " + std::to_string(session.handle + 1));
}

TEST_F(CoreList, DestroysItsCoresWithTheSession) {
  add(0);
  add(3);
  session.close();
  std::sort(destroyed.begin(), destroyed.end());
  EXPECT_EQ(destroyed, std::vector<std::string>({"0", "3"}));
  EXPECT_EQ(get(0), nullptr);
  EXPECT_EQ(thrownBy([this] { add(0); }), "logic: session " + std::to_string(session.handle) + " is closed");
}

TEST_F(CoreList, CoresKeepWhatTheyWereGiven) {
  TestCore core(session.handle, {1, 2, 3}, destroyed), other(session.handle, {0, 1, 0}, destroyed);
  EXPECT_EQ(core.getCoreType(), 9U);
  EXPECT_EQ(core.status(), "3 bytes, 10");
  EXPECT_EQ(core.getCorePhysicalSignalCount(3), 0U);
  core.setCorePhysicalSignalCounts();
  other = core;
  EXPECT_EQ(other.getCorePhysicalSignalCount(3), 17U);
  EXPECT_EQ(other.getCoreRef().core_index, 3U);
}

}  // namespace
