#include "ChainScan.h"

#include <gtest/gtest.h>

namespace QorRT {
namespace {

using Bytes = std::vector<unsigned char>;

const std::vector<Qor_Device> threeDevices{{0, "a", 4}, {0, "b", 6}, {0, "c", 9}};

TEST(ChainScan, irScanPutsTheOpcodeAmongBypasses) {
  const std::vector<Bytes> expected{{0xF2, 0xFF, 0x07}, {0x2F, 0xFC, 0x07}, {0xFF, 0x0B, 0x00}};
  for (unsigned device = 0; device < 3; ++device) {
    const ChainScan scan = chainIrScan(threeDevices, device, 2);
    EXPECT_EQ(scan.bits, expected[device]) << device;
    EXPECT_EQ(scan.bitCount, 19u) << device;
  }
}

TEST(ChainScan, irScanUsesAsManyBitsAsTheIrHas) {
  EXPECT_EQ(chainIrScan({{0, "a", 4}}, 0, 0x123).bits, Bytes{0x03});
  EXPECT_EQ(chainIrScan({{0, "a", 66}}, 0, ~0ull).bits, (Bytes{255, 255, 255, 255, 255, 255, 255, 255, 0}));
}

TEST(ChainScan, drScanPutsOnesAroundTheDevicesBits) {
  const std::vector<Bytes> expected{{0x01, 0xF8}, {0x03, 0xF0}, {0x07, 0xE0}, {0x0F, 0xC0}, {0x1F, 0x80}};
  for (unsigned device = 0; device < 5; ++device) {
    const ChainScan scan = chainDrScan(5, device, {0x01, 0x00}, 11);
    EXPECT_EQ(scan.bitCount, 15u) << device;
    Bytes bits = expected[device];
    bits[1] &= 0x7F;
    EXPECT_EQ(scan.bits, bits) << device;
  }
  EXPECT_EQ(chainDrScan(10, 9, {0xFE}, 3).bits, (Bytes{0xFF, 0x0D}));
}

TEST(ChainScan, captureSkipsTheDevicesNearerToTdo) {
  const std::vector<Bytes> expected{{0x34, 0x02}, {0x1A, 0x01}, {0x8D, 0x00}};
  for (unsigned device = 0; device < 3; ++device)
    EXPECT_EQ(chainDrCapture(device, {0x34, 0xF2}, 10), expected[device]) << device;
  EXPECT_EQ(chainDrCapture(9, {0xFF, 0x0B}, 3), Bytes{0x05});
  EXPECT_EQ(chainDrCapture(8, {0x00}, 0), Bytes());
}

}  // namespace
}  // namespace QorRT
