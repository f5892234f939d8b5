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
      {CoreSpec(wide).version(10, 1).cgVersion(15, 16, 255), "0000300020001FFFFFF10F00010A0951"},
      {qorsim::otherCore(255).version(1, 2).revision(3), "0000000000000000000000030201FF51"},
  };
  for (const auto& [core, word] : cases) {
    const auto cable = chain().device().core(1, 0, core).cable();
    EXPECT_EQ(hexOf(SimHost::reversed(SimHost(*cable).send(0, 1, 128).substr(3))), word);
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
  EXPECT_EQ(host.send(2, 0x11, 0, first + second + "11", 32), "A0");
  EXPECT_EQ(host.send(2, 0x12, 0, second + other + "01", 32), "A0");
  EXPECT_EQ(seen[0], first + std::string(seen[0].size() - 16, '1'));
  EXPECT_EQ(seen[1].substr(0, 16), second);
  EXPECT_NE(seen[1].find("000" + other + "0"), std::string::npos);
}

// Records of one asynchronous input, then one synchronous input.
TEST(SimCore, tellsEachActivityOnce) {
  unsigned char level = 1;
  bool glitch = false;
  const auto design = qorsim::callback(
      [&](Ports& ports) {
        ports.asyncIn[0] = ports.syncIn[0] = level;
        if (std::exchange(glitch, false)) ports.glitchAsyncIn(0), ports.glitchSyncIn(0);
      },
      [](Ports& ports) { ports.asyncIn[0] = ports.syncIn[0] = 1; });
  const auto cable = chain().device().core(1, 0, vio().asyncIn(1).syncIn(1).design(design)).cable();
  SimHost host(*cable);
  const struct {
    const char* what;
    unsigned char level;
    bool glitch;
    unsigned code;
    int room;
    std::string answer;
  } steps[] = {
      {"power-up is no activity", 1, false, 3, 0, "A0 1000100000"},
      {"a fall, of which the last bit is not fetched", 0, false, 3, -1, "damaged"},
      {"03 adds to what was not delivered", 1, false, 3, 0, "A8 1110111110"},
      {"05 adds to what was", 1, false, 5, 0, "A8 1110111110"},
      {"03 replaces what was", 1, false, 3, 0, "A0 1000100000"},
      {"a fall seen while nothing is asked", 0, false, 0xF, 0, "A0"},
      {"still there for the next snapshot", 0, false, 3, 0, "A0 0010001010"},
      {"a glitch is of the async kind only", 0, true, 3, 0, "A0 0110011000"},
      {"quiet again", 0, false, 3, 0, "A0 0000000000"},
  };
  unsigned tag = 0x11;
  for (const auto& step : steps) {
    level = step.level;
    glitch = step.glitch;
    EXPECT_EQ(host.send(step.code, tag++, step.code == 0xF ? 0 : 10, "", step.room), step.answer)
        << step.what;
  }
}

TEST(SimCore, readyMadeDesignsDriveTheInputs) {
  const std::pair<std::shared_ptr<qorsim::Design>, std::string> cases[] = {
      {qorsim::idle(), "0000 000"},
      {qorsim::counter(), "1011 101"},
      {qorsim::toggle(), "1111 111"},
      {qorsim::loopback(), "1000 100"},
  };
  for (const auto& [design, expected] : cases) {
    const CoreSpec core = vio().asyncOut(1).syncOut(1).asyncIn(4).syncIn(3).design(design);
    const auto cable = chain().tcksPerClock(4).device().core(1, 0, core).cable();
    SimHost host(*cable);
    host.send(2, 1, 0, "1" + std::string(16, '1') + "11");      // 50 TCKs
    const std::string records = host.send(3, 1, 34).substr(3);  // takes it in the 13th clock
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
