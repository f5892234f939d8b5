// The simulated hub and its cores, scan by scan. The comparison with the Verilog plays random ones.
#include <gtest/gtest.h>

#include "tests/platform/SimHost.h"
#include "tests/platform/ThrownBy.h"

namespace {

using qorsim::chain;
using qorsim::CoreSpec;
using qorsim::Ports;
using qorsim::vio;

TEST(SimHub, deliversTheWorkedExample) {
  const auto design = qorsim::callback(
      [](Ports& ports) {
        ports.asyncIn[0] = ports.syncIn[0] = 1;
        ports.syncIn[1] = 0;
      },
      [](Ports& ports) { ports.syncIn[1] = 1; });
  const auto core = vio().asyncOut(2).syncOut(1).asyncIn(1).syncIn(2).design(design);
  const auto cable = chain().device(1).core(1, 0, core).cable();
  const struct {
    std::size_t bits;
    std::string out, in;
  } scans[] = {
      {236, "FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFEB263E808004401",
       "00E23A6595000010002000200010000100000A0951D0000000000000001"},
      {161, "1FFFFFFFFFFFFDA199DEA400012BC70B9B0004409", "0010BBCD327A00000000000000000000000000001"},
      {124, "FFFFFFFFFFFFFFFFEBB79116C00440D", "00AC9466D8CD0AD0000000000000001"},
  };
  SimHost host(*cable);
  for (const auto& scan : scans) EXPECT_EQ(hexOf(host.scan(bitsOfHex(scan.out, scan.bits))), scan.in);
}

// A core with one bit of every port but the synchronous inputs: its outputs loop back.
TEST(SimHub, answersEachCommand) {
  const std::string train(16, '1'), none(16, '0'), rise = "1" + none + "10", fall = "0" + none + "10";
  const struct {
    const char* what;
    unsigned tcksPerClock, core, code, tag;
    std::size_t count;
    std::string digits, answer;
  } steps[] = {
      {"no such core", 1, 5, 0xF, 1, 0, "", "A2"},
      {"no such code", 1, 0, 0x4, 1, 4, "", "A2"},
      {"a status word has no repeat", 1, 0, 0x8, 1, 128, "", "A2"},
      {"nothing but a status word", 1, 15, 0x3, 1, 0, "", "A2"},
      {"nobody knows whether it was obeyed", 1, 0, 0xA, 0x12, 0, rise, "A4"},
      {"a first write", 1, 0, 0x2, 0x11, 0, rise, "A0"},
      {"is read", 1, 0, 0x3, 0x11, 4, "", "A0 1100"},
      {"was obeyed already", 1, 0, 0xA, 0x11, 0, fall, "A0"},
      {"and is not obeyed again", 1, 0, 0x3, 0x12, 4, "", "A0 1000"},
      {"was not obeyed yet", 1, 0, 0xA, 0x12, 0, fall, "A0"},
      {"of another host", 1, 0, 0xA, 0x22, 0, rise, "A4"},
      {"repeats the record before", 1, 0, 0xB, 0x12, 4, "", "A0 1000"},
      {"asks anew", 1, 0, 0xB, 0x13, 4, "", "A0 0010"},
      {"merges a record that was delivered", 1, 0, 0x5, 0x14, 4, "", "A8 0010"},
      {"a train on a stopped clock", 0, 0, 0x2, 0x13, 0, "1" + train + "11", "A0 waits"},
      {"keeps other writes away", 0, 0, 0x2, 0x14, 0, fall, "A4 waits"},
      {"but is repeated", 0, 0, 0xA, 0x13, 0, fall, "A0 waits"},
      {"a read waits too", 0, 0, 0x3, 0x15, 4, "", "A0 waits"},
      {"a snapshot under way serves", 0, 0, 0x3, 0x16, 4, "", "A0 waits"},
      {"with a clock it is taken", 1, 0, 0xB, 0x16, 4, "", "A0 1100"},
      {"a merge that joins a snapshot", 0, 0, 0x3, 0x17, 4, "", "A0 waits"},
      {"merges", 0, 0, 0x5, 0x18, 4, "", "A8 waits"},
      {"what was delivered", 1, 0, 0xD, 0x18, 4, "", "A8 1100"},
      {"the train is over", 1, 0, 0x2, 0x14, 0, fall, "A0"},
      {"a slow clock finds no room", 100, 0, 0x3, 0x19, 4, "", "A0 waits"},
  };
  const auto core = vio().asyncOut(1).syncOut(1).asyncIn(1).design(qorsim::loopback());
  const auto cable = chain().device().core(1, 0, core).core(1, 15, qorsim::otherCore(7)).cable();
  for (const auto& step : steps) {
    cable->setTcksPerClock(step.tcksPerClock);
    SimHost host(*cable, 0, 1, step.core);
    EXPECT_EQ(host.send(step.code, step.tag, step.count, step.digits), step.answer) << step.what;
  }
}

TEST(SimHub, isReachedLateAndAnswersLate) {
  for (unsigned tdi = 0; tdi <= 2; ++tdi) {
    for (unsigned tdo = 0; tdo <= 2; ++tdo) {
      const auto cable = chain().device().lateTdi(tdi).lateTdo(tdo).core(1, 0, qorsim::otherCore(7)).cable();
      SimHost host(*cable);
      const Bits in = host.scan(host.frame(host.header(0xF, 1)) + Bits(60, '1'));
      EXPECT_EQ(in.find('1'), tdo);
      EXPECT_EQ(in.find('1', tdo + 1), 58 + 1 + 5 + tdi + tdo);
    }
  }
}

TEST(SimCore, laysTheStatusWordOutByVersion) {
  const CoreSpec wide = vio().asyncIn(65535).syncIn(1).asyncOut(2).syncOut(3);
  const std::pair<CoreSpec, std::string> cases[] = {
      {vio().asyncIn(255).syncIn(1).asyncOut(2).syncOut(255).version(6, 1).revision(4).manufacturer(255),
       "00000000000000FF0201FF04010609FF"},
      {CoreSpec(wide).version(6, 2), "000000000300020001FFFF0002060951"},
      {CoreSpec(wide).version(10, 1).cgVersion(15, 16, 255), "0000300020001FFFFFF10F00010A0951"},
      {qorsim::otherCore(255).version(1, 2).revision(3), "0000000000000000000000030201FF51"},
  };
  for (const auto& [core, word] : cases) {
    const auto cable = chain().device().core(1, 0, core).cable();
    EXPECT_EQ(hexOf(SimHost::reversed(SimHost(*cable).send(0, 1, 128).substr(3))), word);
  }
}

TEST(SimCore, refusesAPositionBeyondThePort) {
  const auto design = qorsim::callback([](Ports& ports) { ports.asyncIn[8] = 1; });
  const auto cable = chain().device().core(1, 0, vio().asyncIn(8).design(design)).cable();
  cable->idle(1);
  EXPECT_EQ(thrownBy([&] { cable->flush(); }), "logic: There is no bit 8 in a port of 8 bits");
}

}  // namespace
