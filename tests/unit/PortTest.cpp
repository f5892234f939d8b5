// Whole ports as raw bits.
#include <algorithm>
#include <array>

#include "VioTest.h"

namespace {

using Bytes = std::vector<unsigned char>;

TEST_F(VioTest, AsyncBitsAndMaskAreSentInPortOrder) {
  initCore(0, 0, 3, 1);
  const unsigned char values[] = {0xFD};  // bits above the width are nobody's
  const unsigned char mask[] = {0xFC};
  EXPECT_EQ(QorVIO_setPortBits(session, ref, values, mask, 3, nullptr, nullptr, 0), 0U);
  EXPECT_EQ(writtenDigits(3 + 16 + 3 + 1),
            "101"
            "0000000000000000"
            "001"
            "0");
}

TEST_F(VioTest, SyncStepPlanesBecomePulseTrains) {
  initCore(0, 0, 0, 10);
  Bytes planes(32);
  planes[2 * 0 + 0] = 0x01;   // bit 0 at step 0
  planes[2 * 7 + 1] = 0x02;   // bit 9 at step 7
  planes[2 * 15 + 1] = 0xFE;  // bit 9 at step 15, and bits above the width
  const unsigned char mask[] = {0x01, 0x02};
  EXPECT_EQ(QorVIO_setPortBits(session, ref, nullptr, nullptr, 0, planes.data(), mask, 10), 0U);
  std::string expected = "1000000000000000";
  for (int bit = 1; bit < 9; ++bit) expected += "0000000000000000";
  expected += "0000000100000001";
  EXPECT_EQ(writtenDigits(170), expected + "1000000001");
}

TEST_F(VioTest, APortLeftOutIsSentAsItWasAndNotAddressed) {
  initCore(0, 0, 2, 1);
  const unsigned char ones[32] = {0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF,
                                  0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF};
  EXPECT_EQ(QorVIO_setPortBits(session, ref, ones, ones, 2, ones, ones, 1), 0U);
  EXPECT_EQ(writtenDigits(21),
            "11"
            "1111111111111111"
            "11"
            "1");
  const unsigned char none[] = {0};
  EXPECT_EQ(QorVIO_setPortBits(session, ref, none, ones, 2, nullptr, nullptr, 0), 0U);
  EXPECT_EQ(writtenDigits(21),
            "00"
            "1111111111111111"
            "11"
            "0");
  EXPECT_EQ(QorVIO_setPortBits(session, ref, nullptr, nullptr, 0, nullptr, nullptr, 0), 0U);
  EXPECT_EQ(writtenDigits(21),
            "00"
            "1111111111111111"
            "00"
            "0");
}

class GetPorts : public VioTest {
 protected:
  GetPorts() {
    initCore(2, 1, 1, 0);
    siblings.readDigits =
        "1010"
        "1100"
        "110110";
  }
};

TEST_F(GetPorts, DeliversEveryKindAndLeavesBitsAboveTheWidth) {
  std::array<unsigned char, 8> b{};
  b.fill(0xA0);
  EXPECT_EQ(QorVIO_getPortBits(session, ref, &b[0], &b[1], &b[2], 2, &b[3], &b[4], &b[5], &b[6], &b[7], 1),
            0U);
  EXPECT_THAT(b, ElementsAre(0xA3, 0xA2, 0xA1, 0xA1, 0xA1, 0xA0, 0xA1, 0xA1));
}

TEST_F(GetPorts, SkipsNullBuffersAndPortsWithCountZeroButAlwaysReads) {
  unsigned char value = 0;
  EXPECT_EQ(QorVIO_getPortBits(session, ref, &value, nullptr, nullptr, 0, nullptr, nullptr, nullptr, nullptr,
                               nullptr, 0),
            0U);
  EXPECT_EQ(value, 0);
  EXPECT_THAT(siblings.take(), ElementsAre("lock 7 60000", testing::StartsWith("sequence"), "unlock 7"));
  EXPECT_EQ(QorVIO_getPortBits(session, ref, nullptr, nullptr, nullptr, 2, &value, nullptr, nullptr, nullptr,
                               nullptr, 1),
            0U);
  EXPECT_EQ(value, 1);
  core().getPortBits(session, ref, &value, nullptr, nullptr, 77, nullptr, nullptr, nullptr, nullptr, nullptr,
                     0);
  EXPECT_EQ(value, 3);
}

TEST_F(VioTest, TheWidestPortsGoRoundWhole) {
  constexpr unsigned width = 65535;
  initCore(width, width, width, width);
  Bytes values((width + 7) / 8);
  Bytes planes(16 * values.size());
  for (std::size_t i = 0; i < values.size(); ++i) values[i] = static_cast<unsigned char>(i * 7 + 1);
  for (std::size_t i = 0; i < planes.size(); ++i) planes[i] = static_cast<unsigned char>(i * 11 + (i >> 8));
  EXPECT_EQ(QorVIO_setPortBits(session, ref, values.data(), values.data(), width, planes.data(),
                               values.data(), width),
            0U);
  std::string digits = writtenDigits(2 * width + 17 * width);
  auto bit = [](const Bytes& bytes, std::size_t i) { return (bytes[i / 8] >> (i % 8)) & 1 ? '1' : '0'; };
  std::size_t wrong = 0;
  for (std::size_t i = 0; i < width; ++i) {
    wrong += digits[i] != bit(values, i);
    wrong += digits[17 * width + i] != bit(values, i);
    wrong += digits[18 * width + i] != bit(values, i);
    for (std::size_t s = 0; s < 16; ++s)
      wrong += digits[width + 16 * i + s] != bit(planes, 8 * values.size() * s + i);
  }
  EXPECT_EQ(wrong, 0U);

  siblings.readDigits.clear();
  for (std::size_t i = 0; i < width; ++i) siblings.readDigits += {bit(values, i), '0', '1', '0'};
  for (std::size_t i = 0; i < width; ++i) siblings.readDigits += {'0', '1', '0', '1', bit(values, i), '0'};
  Bytes async(values.size());
  Bytes syncDown(values.size());
  EXPECT_EQ(QorVIO_getPortBits(session, ref, async.data(), nullptr, nullptr, width, nullptr, nullptr, nullptr,
                               nullptr, syncDown.data(), width),
            0U);
  values.back() &= 0x7F;
  EXPECT_EQ(async, values);
  EXPECT_EQ(syncDown, values);
}

}  // namespace
