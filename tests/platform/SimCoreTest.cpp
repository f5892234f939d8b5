// What a simulated VIO core does with its ports.
#include <gtest/gtest.h>

#include "tests/platform/SimHost.h"
#include "tests/platform/ThrownBy.h"

namespace {

using qorsim::chain;
using qorsim::CoreSpec;
using qorsim::Ports;
using qorsim::vio;

TEST(SimCore, laysTheStatusWordOutByVersion) {
  const CoreSpec wide = vio().asyncIn(65535).syncIn(1).asyncOut(2).syncOut(3);
  const std::pair<CoreSpec, std::string> cases[] = {
      {vio().asyncIn(255).syncIn(1).asyncOut(2).syncOut(255).version(6, 1).revision(4).manufacturer(255),
       "00000000000000FF0201FF04010609FF"},
      {CoreSpec(wide).version(6, 2), "000000000300020001FFFF0002060951"},
      {CoreSpec(wide).version(9, 15), "000000000300020001FFFF000F090951"},
      {CoreSpec(wide).version(10, 0), "0000300020001FFFF0000100000A0951"},
      {CoreSpec(wide).version(10, 1).cgVersion(15, 16, 255), "0000300020001FFFFFF10F00010A0951"},
      {qorsim::otherCore(255).version(1, 2).revision(3), "0000000000000000000000030201FF51"},
  };
  for (const auto& [core, word] : cases) {
    const auto cable = chain().device().core(1, 0, core).cable();
    EXPECT_EQ(hexOf(SimHost::reversed(SimHost(*cable).read(128, 0))), word);
  }
}

TEST(SimCore, playsPulseTrainsStepByStepAndHoldsTheLast) {
  std::string seen[2];
  const auto design = qorsim::callback([&seen](Ports& ports) {
    for (std::size_t i = 0; i < 2; ++i) seen[i] += ports.syncOut[i] ? '1' : '0';
  });
  const auto cable = chain().device().core(1, 0, vio().syncOut(2).design(design)).cable();
  SimHost host(*cable);
  const std::string first = "0110100000000001", second = "1010101010101010", other = "0100000000000000";
  host.send(2, first + second + "11");
  EXPECT_EQ(host.send(2, other + other + "01"), "A020");
  cable->idle(16);
  cable->flush();
  EXPECT_EQ(seen[0], first + std::string(16, '1'));
  EXPECT_EQ(seen[1], second.substr(0, 8) + other + std::string(8, '0'));
}

// Records of one asynchronous input, then one synchronous input.
TEST(SimCore, deliversEachActivityOnce) {
  unsigned char level = 1;
  bool glitch = false;
  const auto design = qorsim::callback(
      [&](Ports& ports) {
        ports.asyncIn[0] = ports.syncIn[0] = level;
        if (glitch) ports.glitchAsyncIn(0), ports.glitchSyncIn(0);
      },
      [](Ports& ports) { ports.asyncIn[0] = ports.syncIn[0] = 1; });
  const auto cable = chain().device().core(1, 0, vio().asyncIn(1).syncIn(1).design(design)).cable();
  SimHost host(*cable);
  struct {
    const char* what;
    unsigned char level;
    bool glitch;
    unsigned code;
    bool acknowledge;
    std::string records;
  } const steps[] = {
      {"power-up is no activity", 1, false, 3, true, "1000100000"},
      {"a fall", 0, false, 3, false, "0010001010"},
      {"03 adds to what was not acknowledged", 1, false, 3, true, "1110111110"},
      {"05 adds to what was", 1, false, 5, true, "1110111110"},
      {"03 replaces what was", 1, false, 3, false, "1000100000"},
      {"a rise seen while nothing is asked", 0, false, 0xF, false, ""},
      {"still there for the next snapshot", 0, false, 3, true, "0010001010"},
      {"a glitch is of the async kind only", 0, true, 3, true, "0110011000"},
      {"it came again after the snapshot", 0, false, 3, true, "0110011000"},
      {"quiet again", 0, false, 3, true, "0000000000"},
  };
  for (const auto& step : steps) {
    level = step.level;
    glitch = step.glitch;
    host.send(step.code);
    const std::size_t digits = step.records.size();
    const std::string head = digits == 0 ? "A0F0" : "A0" + std::to_string(step.code) + "0 ";
    EXPECT_EQ(host.send(step.acknowledge ? 4 : 0xF, "", digits), head + step.records) << step.what;
  }
}

TEST(SimCore, readyMadeDesignsDriveTheInputs) {
  const std::pair<std::shared_ptr<qorsim::Design>, std::string> cases[] = {
      {qorsim::idle(), "0000 000"},
      {qorsim::counter(), "1010 101"},
      {qorsim::toggle(), "1111 111"},
      {qorsim::loopback(), "1000 100"},
  };
  for (const auto& [design, expected] : cases) {
    const CoreSpec core = vio().asyncOut(1).syncOut(1).asyncIn(4).syncIn(3).design(design);
    const auto cable = chain().tcksPerClock(4).device().core(1, 0, core).cable();
    SimHost host(*cable);
    host.send(2, "1" + std::string(16, '1') + "11");  // 8 TCKs, 2 clocks
    cable->idle(11);                                  // 2 clocks and 3 TCKs
    const std::string records = host.read(34);        // the next TCK is the fifth clock
    std::string values;
    for (std::size_t i = 0; i < 16; i += 4) values += records[i];
    values += ' ';
    for (std::size_t i = 16; i < 34; i += 6) values += records[i];
    EXPECT_EQ(values, expected);
  }
}

TEST(SimCore, refusesAPositionBeyondThePort) {
  const auto design = qorsim::callback([](Ports& ports) { ports.asyncIn[8] = 1; });
  const auto cable = chain().device().core(1, 0, vio().asyncIn(8).design(design)).cable();
  cable->idle(1);
  EXPECT_EQ(thrownBy([&] { cable->flush(); }), "logic: There is no bit 8 in a port of 8 bits");
}

}  // namespace
