// The simulated chain: a hub scan by scan, the TAP and its wires, the builder, board files. The comparison with the
// Verilog plays random scans to it.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <functional>

#include "Sim.h"
#include "tests/platform/ThrownBy.h"
#include "tests/platform/WireBits.h"

namespace {

using qorsim::chain;
using qorsim::vio;

// With bits that come late on either line: the chip's presence bit by TDO, its answer by both.
TEST(SimHub, DeliversTheWorkedExampleHoweverLateItsLinesAre) {
  const struct {
    std::size_t bits;
    std::string out, in;
  } scans[] = {
      {236, "FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFEB263E808004401",
       "00E23A6595000010002000200010000100000A0951D0000000000000001"},
      {161, "1FFFFFFFFFFFFDA199DEA400012BC70B9B0004409", "0010BBCD327A00000000000000000000000000001"},
      {124, "FFFFFFFFFFFFFFFFEBB79116C00440D", "00AC9466D8CD0AD0000000000000001"},
  };
  for (unsigned late = 0; late < 9; ++late) {
    const unsigned tdi = late % 3, tdo = late / 3;
    const auto design = qorsim::callback(
        [](qorsim::Ports& ports) {
          ports.asyncIn[0] = ports.syncIn[0] = 1;
          ports.syncIn[1] = 0;
        },
        [](qorsim::Ports& ports) { ports.syncIn[1] = 1; });
    const auto core = vio().asyncOut(2).syncOut(1).asyncIn(1).syncIn(2).design(design);
    const auto cable = chain().device(1).lateTdi(tdi).lateTdo(tdo).core(1, 0, core).cable();
    cable->scanIr(0, 1);
    for (const auto& scan : scans) {
      const Bits out = bitsOfHex(scan.out, scan.bits) + "1111", in = bitsOfHex(scan.in, scan.bits);
      const std::size_t number = cable->scanDr(0, bytesOf(out), out.size(), true);
      Bits due = Bits(tdo, '0') + "1" + Bits(tdi, '0') + in.substr(1);
      due.resize(out.size(), '0');
      EXPECT_EQ(bitsOfBytes(cable->captured(number), out.size()), due) << tdi << tdo;
    }
  }
}

// Flag 3 of the head: until a record has been delivered whole, the next one may have activity that was seen before.
TEST(SimHub, SaysThatActivityMayHaveBeenDeliveredBefore) {
  const auto cable = chain().device(1).core(1, 0, vio().asyncIn(1)).cable();
  cable->scanIr(0, 1);
  const auto headOfRead = [&](unsigned tag, std::size_t bits) {
    const Bits header = bitsOf(3, 4) + bitsOf(0, 4) + bitsOf(tag, 16);
    const Bits out = ("10" + header + crc32Of(header)).append(200, '1').substr(0, bits);
    const std::size_t number = cable->scanDr(0, bytesOf(out), bits, true);
    return hexOf(bitsOfBytes(cable->captured(number), bits).substr(59, 8));
  };
  EXPECT_EQ(headOfRead(1, 90), "A0");  // ends before its last bit
  EXPECT_EQ(headOfRead(2, 200), "A8");
  EXPECT_EQ(headOfRead(3, 200), "A0");
}

TEST(SimCore, RefusesAPositionBeyondThePort) {
  const auto design = qorsim::callback([](qorsim::Ports& ports) { ports.asyncIn[8] = 1; });
  const auto cable = chain().device().core(1, 0, vio().asyncIn(8).design(design)).cable();
  cable->idle(1);
  EXPECT_EQ(thrownBy([&] { cable->flush(); }), "logic: There is no bit 8 in a port of 8 bits");
}

/// What TDO is while TMS and TDI take these values: at each rising edge of TCK, then after the last falling one.
std::string moved(qorsim::Pins& pins, const std::string& tms, const std::string& tdi = "") {
  std::string seen;
  for (std::size_t i = 0; i < tms.size(); ++i) {
    const bool bit = i >= tdi.size() || tdi[i] == '1';
    pins.write(false, tms[i] == '1', bit);
    seen += pins.tdo() ? '1' : '0';
    pins.write(true, tms[i] == '1', bit);
    EXPECT_EQ(pins.tdo(), seen.back() == '1');  // it changes when TCK falls
  }
  pins.write(false, true, true);
  return seen;
}

TEST(SimPins, UpdateWhatTheyHoldHoweverTheScanEnded) {
  const std::string reset = "11111", toShiftDr = "100", toShiftIr = "1100", toIdle = "10";
  const std::string bypass = "0" + toShiftIr + "0000001" + toIdle;
  const struct {
    bool trst;
    std::string walk, idcode;
  } cases[] = {
      {false, "0", "0A5F1093"},     // selected at power-up
      {false, bypass, "FFFFFFFE"},  // TDI is 1 throughout
      {false, bypass + reset + "0", "0A5F1093"},
      {true, bypass, "0A5F1093"},
      {false, bypass + "110110", "0A5F1093"},                // captured and updated, without a shift
      {false, "0" + toShiftIr + "11111" + "0", "0A5F1093"},  // by Update-IR to Test-Logic-Reset
      {false, "0" + toShiftIr + "01" + toIdle, "FFFFFFFE"},  // some bits of what was captured stay
      {false, "0" + toShiftIr + "010010" + "0001" + toIdle, "FFFFFFFE"},  // with a pause
  };
  for (const auto& each : cases) {
    const auto pins = chain().device(0x0A5F1093).pins();
    moved(*pins, each.walk);
    pins->setTrst(each.trst);
    if (each.trst) moved(*pins, "0"), pins->setTrst(false), moved(*pins, "0");
    moved(*pins, toShiftDr);
    EXPECT_EQ(hexOf(moved(*pins, std::string(31, '0') + "1")), each.idcode) << each.walk;
  }
  EXPECT_EQ(moved(*chain().device().pins(), "01000110", "00001000"), "11110111");  // high outside Shift
}

TEST(ChainBuilder, NamesWhatIsWrong) {
  const auto place = [](unsigned userChain, unsigned index, const qorsim::CoreSpec& core) {
    return [=] { chain().device().device().core(1, 2, vio()).core(userChain, index, core); };
  };
  const std::pair<std::function<void()>, std::string> cases[] = {
      {[] { chain().cable(); }, "chain: device is missing: a chain has at least one"},
      {[] { chain().core(1, 0, vio()); }, "chain: core comes before any device"},
      {[] { chain().device().irLength(3); }, "device 0: ir_length must be 4 to 32, is 3"},
      {place(5, 0, vio()), "device 1, user chain 5, core 0: user_chain must be 1 to 4, is 5"},
      {place(1, 16, vio()), "device 1, user chain 1, core 16: index must be 0 to 15, is 16"},
      {place(2, 2, vio().version(9, 0).cgVersion(1, 0, 0)),
       "device 1, user chain 2, core 2: cg_version is for versions from 10.0 on only, version is 9.0"},
      {place(2, 2, qorsim::otherCore(256)), "device 1, user chain 2, core 2: type must be 0 to 255, is 256"},
      {place(2, 2, qorsim::otherCore(7).design(qorsim::idle())),
       "device 1, user chain 2, core 2: design is for VIO cores only"},
  };
  for (const auto& [build, message] : cases) EXPECT_EQ(thrownBy(build), "logic: " + message);
}

std::string many(const std::string& text, unsigned count) {
  std::string all;
  while (count-- > 0) all += text;
  return all;
}

TEST(BoardFiles, SayWhatIsWrongAndWhere) {
  const std::string core = "[[device]]\n[[device.core]]\nuser_chain=1\nindex=0\n";
  const std::string vioCore = core + "type=\"vio\"\n", at = ":6: device[0].core[0].";
  const std::string device = "[[device]]\nname=", deep = ": is nested more than 16 levels deep";
  const std::pair<std::string, std::string> cases[] = {
      {"", ":1: device: is missing"},
      {"device=[]", ":1: device: must be an array of tables, is an array"},
      {"tcks_per_clock=-1\n[[device]]", ":1: tcks_per_clock: must be 0 to 4294967295, is -1"},
      {"[[device]]\nidcode=\"1\"", ":2: device[0].idcode: must be a whole number, is \"1\""},
      {"[[device]]\nuser_opcodes=[62, 63]", ":2: device[0].user_opcodes: must be 0 to 62, is 63"},
      {"[[device]]\nname=1", ":2: device[0].name: must be a text, is 1"},
      {"colour=6\n[[device]]", ":1: colour: is no key of a board file"},
      {core, ":2: device[0].core[0].type: is missing"},
      {core + "type=\"ila\"", ":5: device[0].core[0].type: must be \"vio\" or a number, is \"ila\""},
      {core + "type=7\nasync_in=8", at + "async_in: is for VIO cores only, is 8"},
      {vioCore + "sync_in=1.5", at + "sync_in: must be a whole number, is a number with a fraction"},
      {vioCore + "version=\"6.1\"\nsync_out=256",
       ":7: device[0].core[0].sync_out: must be 0 to 255 in version 6.1, is 256"},
      {vioCore + "version=\"10.0.1\"", at + "version: must be 2 numbers with dots between, is \"10.0.1\""},
      {vioCore + "version=\"256.0\"", at + "version: must be 0 to 255, is 256"},
      {vioCore + "design=\"blinky\"",
       at + "design: must be \"loopback\", \"counter\", \"toggle\" or \"idle\", is \"blinky\""},
      {vioCore + "[[device.core]]\nuser_chain=1\nindex=0\ntype=7",
       ":8: device[0].core[1].index: is taken on this user chain, is 0"},
      {"[[device]]\nname=\n", ":2: Error while parsing key-value"},
      {many("a.", 16) + "a=1", ":1: device: is missing"},
      {many("a.", 17) + "a=1", ":1" + deep},
      {"[" + many("a.", 31000) + "a]", ":1" + deep},
      {"device=" + many("{a=", 31000), ":1" + deep},
      {device + "\"\"\"\n\"\\\"\"\"\"\"\n" + many("a.", 31000) + "a=1", ":4" + deep},
      {device + "'''\n'''''\nidcode=" + many("[", 31000), ":4" + deep},
      {device + "'\\' # \"\ncore=" + many("[", 31000), ":3" + deep},
      {device + "'''" + many("[.", 31000) + "'''", ""},
      {device + "\"\\\"" + many("[.", 31000) + "\" #" + many("{", 31000), ""},
      {std::string((1 << 20) + 1, '\n'), ": is larger than 1048576 bytes"},
  };
  for (const auto& [text, message] : cases)
    EXPECT_THAT(thrownBy([&, &t = text] { qorsim::boardText(t, "F"); }),
                testing::StartsWith(message.empty() ? "nothing" : "logic: F" + message))
        << text.substr(0, 80);
}

TEST(BoardFiles, AreRegularFiles) {
  const std::string path = testing::TempDir() + "sim_board_" + std::to_string(::getpid());
  ASSERT_EQ(::mkfifo(path.c_str(), 0600), 0);
  const std::pair<std::string, std::string> cases[] = {
      {"no/such.toml", "No such file or directory"},
      {"/", "it is a directory"},
      {path, "it is not a regular file"},
  };
  for (const auto& [name, reason] : cases)
    EXPECT_EQ(thrownBy([&, &n = name] { qorsim::boardFile(n); }),
              "logic: " + name + ": cannot be opened: " + reason);
  std::filesystem::remove(path);
  const std::string examples = QORVIO_SOURCE_DIR "/examples/";
  EXPECT_EQ(qorsim::boardFile(examples + "adapters/board.toml").cable()->devices()[0].idcode, 0x0A5F1093u);
  const auto devices = qorsim::boardFile(examples + "boards/lab.toml").cable()->devices();
  ASSERT_EQ(devices.size(), 3u);
  EXPECT_EQ(devices[1].name + " " + std::to_string(devices[2].irLength), "bridge 8");
}

}  // namespace
