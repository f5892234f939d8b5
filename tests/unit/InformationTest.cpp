// Status words, in every layout, as record and as text map; and what is not a VIO core.
#include "VioTest.h"

namespace {

const char* const wrongType =
    "message 100 QorVIO_getCoreInfo() for the wrong core type or non-existant core.";

std::vector<unsigned> fieldsOf(const QORVIO_CORE_INFO& i) {
  return {i.manufacturer_id,   i.core_type,        i.core_major_version, i.core_minor_version,
          i.core_revision,     i.cg_major_version, i.cg_minor_version,   i.cg_minor_version_alpha,
          i.async_input_count, i.sync_input_count, i.async_output_count, i.sync_output_count};
}

class StatusWord : public VioTest {
 protected:
  /// Every bit of the word is set but for the fields, so that a field read elsewhere shows.
  void answer(unsigned major, unsigned minor, std::vector<std::array<unsigned, 3>> fields) {
    siblings.info = {0x51, 9, major, minor, 3};
    siblings.word.assign(154, 0xFF);
    for (auto [offset, length, value] : fields) siblings.putField(offset, length, value);
  }
};

TEST_F(StatusWord, IsDecodedByTheCoresVersion) {
  struct {
    unsigned major, minor;
    std::vector<std::array<unsigned, 3>> fields;  // offset, length, value
    std::vector<unsigned> cg;
  } const cases[] = {
      {6, 1, {{40, 8, 1}, {48, 8, 2}, {56, 8, 3}, {64, 8, 4}}, {0, 0, 0}},
      {6, 2, {{40, 16, 1}, {56, 16, 2}, {72, 16, 3}, {88, 16, 4}}, {0, 0, 0}},
      {9, 15, {{40, 16, 1}, {56, 16, 2}, {72, 16, 3}, {88, 16, 4}}, {0, 0, 0}},
      {10,
       0,
       {{40, 4, 5}, {44, 8, 6}, {52, 8, 7}, {60, 16, 1}, {76, 16, 2}, {92, 16, 3}, {108, 16, 4}},
       {5, 6, 7}},
  };
  for (const auto& c : cases) {
    answer(c.major, c.minor, c.fields);
    QORVIO_CORE_INFO info{};
    EXPECT_EQ(QorVIO_getInfo(session, ref, &info), 0U);
    EXPECT_THAT(fieldsOf(info),
                ElementsAre(0x51, 9, c.major, c.minor, 3, c.cg[0], c.cg[1], c.cg[2], 1, 2, 3, 4));
    EXPECT_THAT(siblings.take(), ElementsAre("lock 7 60000", "status 0.1.0 1232", "unlock 7"));
  }
}

TEST_F(StatusWord, FillsTwelveEntriesOfTheMapAndLeavesTheOthers) {
  answer(6, 1, {{40, 8, 10}, {48, 8, 0}, {56, 8, 255}, {64, 8, 4}});
  TextMap map{{"note", "mine"}, {"core_type", "old"}};
  TextMap* pointer = &map;
  EXPECT_EQ(QorVIO_getCoreInfo(session, ref, &pointer), 0U);
  std::string told;
  for (const char* key :
       {"manufacturer_id", "core_type", "core_major_version", "core_minor_version", "core_revision",
        "cg_major_version", "cg_minor_version", "cg_minor_version_alpha", "async_input_count",
        "sync_input_count", "async_output_count", "sync_output_count", "note"})
    told += map[key] + ' ';
  EXPECT_EQ(told, "81 9 6 1 3 0 0 0 10 0 255 4 mine ");
  EXPECT_EQ(map.size(), 13U);
}

TEST_F(VioTest, AnotherCoreTypeIsToldAndAbortsUnderTheLock) {
  siblings.info.core_type = 7;
  QORVIO_CORE_INFO info{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12};
  EXPECT_EQ(QorVIO_getInfo(session, ref, &info), failed);
  EXPECT_THAT(fieldsOf(info), testing::Each(0U));
  TextMap map{{"core_type", "old"}};
  TextMap* pointer = &map;
  EXPECT_EQ(QorVIO_getCoreInfo(session, ref, &pointer), failed);
  EXPECT_EQ(map, (TextMap{{"core_type", "old"}}));
  EXPECT_THAT(siblings.take(),
              ElementsAre("lock 7 60000", "status 0.1.0 1232", wrongType, "unlock 7",
                          "message 8000 Qor abort command", "lock 7 60000", "status 0.1.0 1232", wrongType,
                          "unlock 7", "message 8000 Qor abort command"));
}

TEST_F(VioTest, IsVioCoreDecidesByTheRecordAndReturnsTheStatus) {
  for (auto [type, status] : {std::pair{9U, 0U}, {7U, 0U}, {0U, 1U}, {9U, 5U}}) {
    siblings.info.core_type = type;
    siblings.plainStatus = status;
    unsigned result = 99;
    EXPECT_EQ(QorVIO_isVIOCore(session, ref, &result), status);
    EXPECT_EQ(result, type == 9 ? 1U : 0U);
    EXPECT_THAT(siblings.take(), ElementsAre("lock 7 60000", "plain status 0.1.0 null 0", "unlock 7"));
  }
}

}  // namespace
