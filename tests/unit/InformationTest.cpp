// Status words, in every layout, as record and as text map; and what is not a VIO core.
#include <sstream>

#include "tests/unit/VioTest.h"

namespace {

const char* const wrongType =
    "message 100 QorVIO_getCoreInfo() for the wrong core type or non-existant core.";

TEST_F(VioTest, TheStatusWordIsDecodedByTheCoresVersionAndLeavesOtherEntriesOfTheMap) {
  struct {
    unsigned major, minor;
    std::vector<std::array<unsigned, 3>> fields;  // offset, length, value
    const char* entries;
  } const cases[] = {
      {6, 1, {{40, 8, 1}, {48, 8, 0}, {56, 8, 255}, {64, 8, 4}}, "81 9 6 1 3 0 0 0 1 0 255 4 mine "},
      {6, 2, {{40, 16, 1}, {56, 16, 2}, {72, 16, 3}, {88, 16, 4}}, "81 9 6 2 3 0 0 0 1 2 3 4 mine "},
      {9, 15, {{40, 16, 1}, {56, 16, 2}, {72, 16, 3}, {88, 16, 4}}, "81 9 9 15 3 0 0 0 1 2 3 4 mine "},
      {10,
       0,
       {{40, 4, 5}, {44, 8, 6}, {52, 8, 7}, {60, 16, 1}, {76, 16, 2}, {92, 16, 3}, {108, 16, 4}},
       "81 9 10 0 3 5 6 7 1 2 3 4 mine "},
  };
  for (const auto& c : cases) {
    platform.info = {0x51, 9, c.major, c.minor, 3};
    platform.word.assign(154, 0xFF);  // so that a field read elsewhere shows
    for (auto [offset, length, value] : c.fields) platform.putField(offset, length, value);
    TextMap map{{"note", "mine"}, {"core_type", "old"}};
    TextMap* pointer = &map;
    EXPECT_EQ(QorVIO_getCoreInfo(session, ref, &pointer), 0U);
    std::string told;
    std::istringstream keys(
        "manufacturer_id core_type core_major_version core_minor_version core_revision cg_major_version "
        "cg_minor_version cg_minor_version_alpha async_input_count sync_input_count async_output_count "
        "sync_output_count note");
    for (std::string key; keys >> key;) told += map[key] + ' ';
    EXPECT_EQ(told, c.entries);
    EXPECT_EQ(map.size(), 13U);
    EXPECT_THAT(platform.take(), ElementsAre("lock 7 60000", "status 0.1.0 1232", "unlock 7"));
  }
}

TEST_F(VioTest, AnotherCoreTypeIsToldAndAbortsUnderTheLock) {
  platform.info.core_type = 7;
  QORVIO_CORE_INFO info{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12};
  EXPECT_EQ(QorVIO_getInfo(session, ref, &info), failed);
  EXPECT_EQ(info.core_type, 0U);
  EXPECT_EQ(info.sync_output_count, 0U);
  TextMap map{{"core_type", "old"}};
  TextMap* pointer = &map;
  EXPECT_EQ(QorVIO_getCoreInfo(session, ref, &pointer), failed);
  EXPECT_EQ(map, (TextMap{{"core_type", "old"}}));
  EXPECT_THAT(platform.take(),
              ElementsAre("lock 7 60000", "status 0.1.0 1232", wrongType, "unlock 7",
                          "message 8000 Qor abort command", "lock 7 60000", "status 0.1.0 1232", wrongType,
                          "unlock 7", "message 8000 Qor abort command"));
}

TEST_F(VioTest, IsVioCoreDecidesByTheRecordAndReturnsTheStatus) {
  for (auto [type, status] : {std::pair{9U, 0U}, {7U, 0U}, {0U, 1U}, {9U, 5U}}) {
    platform.info.core_type = type;
    platform.plainStatus = status;
    unsigned result = 99;
    EXPECT_EQ(QorVIO_isVIOCore(session, ref, &result), status);
    EXPECT_EQ(result, type == 9 ? 1U : 0U);
    EXPECT_THAT(platform.take(), ElementsAre("lock 7 60000", "plain status 0.1.0 null 0", "unlock 7"));
  }
}

}  // namespace
