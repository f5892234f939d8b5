// A core on the fakes, and the short names that the tests use.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "QorVIO.h"
#include "QorVIO_Core.h"
#include "tests/unit/fakes/FakePlatform.h"

using QorRT::hash_map;
using TextMap = hash_map<std::string, std::string>;
using testing::ElementsAre;

constexpr unsigned session = 7;
constexpr unsigned failed = 0x80000000;
constexpr QOR_CORE_REF ref{0, 1, 0};
constexpr const char* lookupFailed =
    "Data structures not initialized for VIO core Device:0, user chain number:1, core index:0.";

enum PortType : unsigned { syncOut, syncIn, asyncOut, asyncIn };

class VioTest : public testing::Test {
 protected:
  VioTest() { fake::reset(); }
  ~VioTest() override { fake::reset(); }

  fake::Platform& platform = fake::platform();

  /// Sets up a core of these widths at `ref`, and forgets the calls that took.
  void initCore(unsigned asyncInWidth, unsigned syncInWidth, unsigned asyncOutWidth, unsigned syncOutWidth) {
    platform.answerAsVioCore(asyncInWidth, syncInWidth, asyncOutWidth, syncOutWidth);
    ASSERT_EQ(QorVIO_initCore(session, ref), 0U);
    platform.take();
  }

  unsigned define(const char* name, unsigned type, std::vector<unsigned> bits) {
    return QorVIO_defineBus(session, ref, name, type, bits.data(), static_cast<unsigned>(bits.size()));
  }

  unsigned write(TextMap map) {
    TextMap* pointer = &map;
    return QorVIO_writeValues(session, ref, &pointer);
  }

  TextMap read(TextMap map = {}) {
    TextMap* pointer = &map;
    EXPECT_EQ(QorVIO_readValues(session, ref, &pointer), 0U);
    return map;
  }

  /// The core object itself, for its members that no plain function reaches.
  QorRT::QorVIO_Core& core() {
    return dynamic_cast<QorRT::QorVIO_Core&>(*QorRT::Qor_CoreList::getCore(session, ref));
  }

  /// The calls of one that fails with this one message after taking the lock.
  static auto locked(const std::string& message) {
    return ElementsAre("lock 7 60000", "unlock 7", "message 100 " + message);
  }

  /// The data digits that the only write since the last look sent: async values, pulse trains, both masks.
  std::string writtenDigits(std::size_t count);
};
