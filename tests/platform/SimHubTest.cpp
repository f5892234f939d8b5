// The hub at the level of single scans.
#include <gtest/gtest.h>

#include "tests/platform/SimHost.h"

namespace {

using qorsim::chain;
using qorsim::Ports;
using qorsim::vio;

TEST(SimHub, deliversTheReferenceScans) {
  const auto design = qorsim::callback(
      [](Ports& ports) {
        ports.asyncIn[0] = ports.syncIn[0] = 1;
        ports.syncIn[1] = 0;
      },
      [](Ports& ports) { ports.syncIn[1] = 1; });
  const auto cable =
      chain().device(1).core(1, 0, vio().asyncOut(2).syncOut(1).asyncIn(1).syncIn(2).design(design)).cable();
  struct {
    std::size_t bits;
    std::string out, in;
  } const scans[] = {
      {26, "3C1E001", ""},
      {160, "07F7F07FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFF", "E2E0000010002000200010000100000A0951A000"},
      {47, "623F90400011", ""},
      {32, "07F7F07F", "897EA020"},
      {26, "307ECC1", ""},
      {48, "B27C407FFFFF", "5F72CD0AA030"},
      {32, "07F7F07F", "EC2BA040"},
  };
  SimHost host(*cable);
  for (const auto& scan : scans) {
    const std::string in = hexOf(host.scan(bitsOfHex(scan.out, scan.bits)));
    EXPECT_EQ(scan.in.empty() ? "" : in, scan.in) << scan.out;
  }
}

TEST(SimHub, tellsWhyAFrameWasNotObeyed) {
  const auto cable = chain().device().core(1, 0, vio().asyncOut(3)).core(1, 15, qorsim::otherCore(7)).cable();
  struct {
    unsigned core, code;
    std::string digits, head;
  } const cases[] = {
      {0, 0x2, "111111", "A020"}, {0, 0x2, "11111", "A0F1"}, {0, 0xF, "1", "A0F1"}, {0, 0x4, "", "A0F4"},
      {0, 0x7, "", "A072"},       {5, 0xF, "", "A5F2"},      {15, 0xF, "", "AFF0"}, {15, 0x3, "", "AF32"},
  };
  for (const auto& each : cases) {
    SimHost(*cable).send(0xF);
    SimHost(*cable, 0, 1, each.core).send(each.code, each.digits);
    EXPECT_EQ(SimHost(*cable).send(0xF), each.head) << each.core << " " << each.code << " " << each.digits;
  }
  SimHost(*cable).scan(std::string(40, '1'));
  EXPECT_EQ(SimHost(*cable).send(0xF), "A0F1");
}

TEST(SimHub, waitsForAStoppedDesignClock) {
  const auto core = vio().asyncOut(1).syncOut(1).asyncIn(1).design(qorsim::loopback());
  const auto cable = chain().tcksPerClock(0).device().core(1, 0, core).cable();
  SimHost host(*cable);
  const std::string train(16, '1');
  host.send(2, "1" + train + "10");  // leaves nothing for the design clock to do
  EXPECT_EQ(host.send(3), "A020");
  EXPECT_EQ(host.send(4, "", 4), "A038 0000");
  EXPECT_EQ(host.send(2, "1" + train + "11", 4), "A03C 0000");
  EXPECT_EQ(host.send(2, "0" + train + "11"), "A028");
  EXPECT_EQ(host.send(3), "A02C");
  cable->setTcksPerClock(1);
  EXPECT_EQ(host.send(0xF, "", 4), "A038 0000");
  EXPECT_EQ(host.send(3), "A0F0");
  EXPECT_EQ(host.send(4, "", 4), "A030 1100");
  EXPECT_EQ(host.send(0xF), "A040");
}

TEST(SimHub, acknowledgesOnlyWhatTheSameScanDelivered) {
  const auto cable = chain().device().core(1, 0, vio().asyncIn(1)).core(1, 1, vio().asyncIn(1)).cable();
  SimHost first(*cable), second(*cable, 0, 1, 1);
  first.send(3);
  second.send(4);
  EXPECT_EQ(second.send(4, "", 4), "A034 0000");
  second.send(5);
  EXPECT_EQ(second.send(0xF, "", 4), "A150 0000");
  second.send(4);
  EXPECT_EQ(second.send(0xF), "A1F4");
}

}  // namespace
