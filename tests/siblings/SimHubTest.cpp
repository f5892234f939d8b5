// The hub at the level of single scans.
#include <gtest/gtest.h>

#include "SimHost.h"

namespace {

using qorsim::chain;
using qorsim::loopback;
using qorsim::otherCore;
using qorsim::Ports;
using qorsim::vio;

std::string bitsOf(const std::string& hex, std::size_t count) {
  std::string bits;
  for (auto digit = hex.rbegin(); digit != hex.rend(); ++digit)
    bits += SimHost::number(static_cast<unsigned>(std::stoul(std::string(1, *digit), nullptr, 16)), 4);
  bits.resize(count, '0');
  return bits;
}

TEST(SimHub, deliversTheReferenceScans) {
  const auto design = qorsim::callback(
      [](Ports& ports) {
        ports.asyncIn[0] = 1;
        ports.syncIn[0] = 1;
        ports.syncIn[1] = 0;
      },
      [](Ports& ports) { ports.syncIn[1] = 1; });
  const auto cable =
      chain().device(1).core(1, 0, vio().asyncOut(2).syncOut(1).asyncIn(1).syncIn(2).design(design)).cable();
  struct Scan {
    std::size_t bits;
    std::string out, in;
  };
  const std::vector<Scan> scans{
      {26, "3C1E001", ""},
      {160, "07F7F07FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFF", "E2E0000010002000200010000100000A0951A000"},
      {47, "623F90400011", ""},
      {32, "07F7F07F", "897EA020"},
      {26, "307ECC1", ""},
      {48, "B27C407FFFFF", "5F72CD0AA030"},
      {32, "07F7F07F", "EC2BA040"},
  };
  SimHost host(*cable);
  for (const Scan& scan : scans) {
    const std::string in = host.scan(bitsOf(scan.out, scan.bits));
    if (scan.in.empty()) continue;
    EXPECT_EQ(SimHost::hex(in), scan.in) << scan.out;
  }
}

TEST(SimHub, rejectsAFrameWithAnyFlippedBit) {
  const auto cable = chain().device().core(1, 0, vio().asyncOut(3)).cable();
  SimHost host(*cable);
  host.send(0xF);
  const std::string frame = host.frame(2, "101111");
  for (std::size_t i = 0; i < frame.size(); ++i) {
    std::string flipped = frame;
    flipped[i] ^= 1;
    host.sendFrame(flipped);
    EXPECT_EQ(host.send(0xF), "A0F1") << i;
  }
  EXPECT_EQ(host.send(0xF), "A0F0");
}

TEST(SimHub, tellsWhyAFrameWasNotObeyed) {
  const auto cable = chain().device().core(1, 0, vio().asyncOut(3)).core(1, 15, otherCore(7)).cable();
  struct Case {
    unsigned core, code;
    std::string digits, head;
  };
  const std::vector<Case> cases{
      {0, 0x2, "111111", "A020"}, {0, 0x2, "11111", "A0F1"}, {0, 0x2, "", "A0F1"},  {0, 0xF, "1", "A0F1"},
      {0, 0x4, "", "A0F4"},       {0, 0x7, "", "A072"},      {5, 0xF, "", "A5F2"},  {5, 0x2, "11", "A522"},
      {15, 0xF, "", "AFF0"},      {15, 0x3, "", "AF32"},     {15, 0x2, "", "AF22"},
  };
  for (const Case& each : cases) {
    SimHost(*cable).send(0xF);
    SimHost(*cable, 0, 1, each.core).send(each.code, each.digits);
    EXPECT_EQ(SimHost(*cable).send(0xF), each.head) << each.core << " " << each.code << " " << each.digits;
  }
  SimHost(*cable).scan(std::string(40, '1'));
  EXPECT_EQ(SimHost(*cable).send(0xF), "A0F1");
}

TEST(SimHub, waitsForAStoppedDesignClock) {
  const auto board =
      chain().tcksPerClock(0).device().core(1, 0, vio().asyncOut(1).syncOut(1).asyncIn(1).design(loopback()));
  const auto running = board.cable();
  SimHost host(*running);
  const std::string train(16, '1');
  host.send(2, "1" + train + "10");  // leaves nothing for the design clock to do
  EXPECT_EQ(host.send(3), "A020");
  EXPECT_EQ(host.send(4, "", 4), "A038 0000");
  EXPECT_EQ(host.send(2, "1" + train + "11", 4), "A03C 0000");
  EXPECT_EQ(host.send(2, "0" + train + "11"), "A028");
  EXPECT_EQ(host.send(3), "A02C");
  running->setTcksPerClock(1);
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
