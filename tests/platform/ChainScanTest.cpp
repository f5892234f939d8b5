#include "ChainScan.h"

#include <gtest/gtest.h>

// That every device of a chain is reached, the tests of boards show.
namespace QorRT {
namespace {

using Bytes = std::vector<unsigned char>;

TEST(ChainScan, irScanUsesAsManyBitsAsTheIrHas) {
  const ChainScan scan = chainIrScan({{0, "a", 4}, {0, "b", 6}, {0, "c", 9}}, 1, 2);
  EXPECT_EQ(scan.bits, (Bytes{0x2F, 0xFC, 0x07}));
  EXPECT_EQ(scan.bitCount, 19u);
  EXPECT_EQ(chainIrScan({{0, "a", 4}}, 0, 0x123).bits, Bytes{0x03});
  EXPECT_EQ(chainIrScan({{0, "a", 66}}, 0, ~0ull).bits, (Bytes{255, 255, 255, 255, 255, 255, 255, 255, 3}));
}

TEST(ChainScan, drScanPutsOnesAroundTheDevicesBitsAndCaptureTakesThemOut) {
  const ChainScan scan = chainDrScan(5, 1, {0x01, 0x00}, 11);
  EXPECT_EQ(scan.bitCount, 15u);
  EXPECT_EQ(scan.bits, (Bytes{0x03, 0x70}));
  EXPECT_EQ(chainDrScan(10, 9, {0xFE}, 3).bits, (Bytes{0xFF, 0x0D}));
  EXPECT_EQ(chainDrCapture(1, {0x34, 0xF2}, 10), (Bytes{0x1A, 0x01}));
  EXPECT_EQ(chainDrCapture(9, {0xFF, 0x0B}, 3), Bytes{0x05});
  EXPECT_EQ(chainDrCapture(8, {0x00}, 0), Bytes());
}

}  // namespace
}  // namespace QorRT
