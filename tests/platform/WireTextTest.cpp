// What the cables to servers read and write, without a server: URLs, board files, captures of an unknown chain,
// the texts of a Tcl port.
#include <gtest/gtest.h>

#include "QorJtag_Host.h"
#include "platform/jtag/cable/openocd/OpenOcdText.h"
#include "platform/jtag/cable/wire/ChainProbe.h"
#include "platform/jtag/cable/wire/WireUrl.h"
#include "tests/platform/ThrownBy.h"
#include "tests/platform/WireBits.h"

namespace {

using QorRT::CaptureReader;
using QorRT::DeviceEntry;
using QorRT::OpenOcdTap;
using QorRT::Qor_Device;
using QorRT::Qor_Scan;
using QorRT::WireDevice;
using Bytes = std::vector<unsigned char>;

TEST(WireUrls, NameAServerAndOptions) {
  const std::vector<std::string> options{"board", "config", "timeout"};
  const QorRT::WireUrl url =
      QorRT::parseWireUrl("rbb", "[::1]:9000?timeout=0.5&config=a%26b%3d%C3%A4.cfg&board=none.toml", options);
  EXPECT_EQ(url.endpoint.text() + " " + url.config + " " + url.board, "::1:9000 a&b=\xC3\xA4.cfg none.toml");
  EXPECT_EQ(url.timeout.count(), 0.5);
  const std::pair<const char*, const char*> bad[] = {
      {"host", "names no server: HOST:PORT is due, with a port of 1 to 65535"},
      {":1", "names no server: HOST:PORT is due, with a port of 1 to 65535"},
      {"host:65536", "names no server: HOST:PORT is due, with a port of 1 to 65535"},
      {"host:1?board", "gives the option \"board\" no value"},
      {"host:1?board=%2", "has a \"%\" without two hexadecimal digits after it"},
      {"host:1?board=%2g", "has a \"%\" without two hexadecimal digits after it"},
      {"host:1?speed=3", "has the unknown option \"speed\"; known: board, config, timeout"},
      {"host:1?timeout=0", "has a timeout that is not 0 to 3600 seconds"},
      {"host:1?timeout=1s", "has a timeout that is not 0 to 3600 seconds"},
  };
  for (const auto& [rest, problem] : bad)
    EXPECT_EQ(thrownBy([&options, rest = rest] { QorRT::parseWireUrl("rbb", rest, options); }),
              "logic: the cable URL \"rbb:" + std::string(rest) + "\" " + problem);
  for (const std::string start : {"rbb:host:1?config=a", "openocd:host:1?config=a"}) {
    EXPECT_EQ(
        thrownBy([&] { QorRT::openCable(start.c_str()); }),
        "logic: the cable URL \"" + start + "\" has the unknown option \"config\"; known: board, timeout");
  }
}

// What an idle chain of that many bits shows a probe of ones: its own bits, then the probe.
Bytes behind(const std::string& wire, std::size_t bitCount) {
  std::string all = wire;
  all.resize(bitCount, '1');
  return bytesOf(all);
}

// The devices, with the IR lengths of the capture or, where it leaves them open, of the board file.
std::string chainSeen(const std::string& idcodes, const std::string& irs, const std::string& board) {
  std::string text;
  const std::string thrown = thrownBy([&] {
    std::vector<Qor_Device> found = QorRT::idcodesIn(behind(idcodes, QorRT::idcodeProbe().bitCount));
    const Bytes captured = behind(irs + "0", QorRT::irProbe().bitCount);
    QorRT::readIrLengths(found, captured);
    std::vector<WireDevice> devices(found.size());
    if (!board.empty()) devices = QorRT::describedDevices(found, QorRT::boardDevicesOf(board, "b.toml"));
    if (!board.empty()) QorRT::requireIrs(devices, captured);
    for (std::size_t i = 0; i < found.size(); ++i)
      text += QorRT::idcodeText(found[i].idcode) + "/" +
              std::to_string(std::max(found[i].irLength, devices[i].head.irLength)) + " ";
  });
  return thrown == "nothing" ? text : thrown;
}

TEST(Probes, ShowWhatIsOnAChainOrHowTdoIsStuck) {
  const std::string fpga = bitsOf(0x0A5F1093, 32), cpld = bitsOf(0x1234567B, 32);
  const std::size_t probe = QorRT::idcodeProbe().bitCount;
  const std::string silent =
      "runtime: the instruction registers of the chain do not answer: TDO brings back no 1 and 0";
  const auto lengths = [](unsigned first, unsigned second) {
    return "[[device]]\nir_length=" + std::to_string(first) +
           "\n[[device]]\nir_length=" + std::to_string(second);
  };
  std::string noise;
  while (noise.size() < probe) noise += fpga;
  const struct {
    std::string idcodes, irs, board, seen;
  } cases[] = {
      {fpga + "0" + cpld, "100000100010000000", "", "0A5F1093/6 00000000/4 1234567B/8 "},
      {fpga, "110011", "", "0A5F1093/6 "},
      {fpga + cpld, "1010001000", "", "0A5F1093/0 1234567B/0 "},  // read in two ways
      {fpga + cpld, "1010001000", lengths(6, 4), "0A5F1093/6 1234567B/4 "},
      {fpga + cpld, "1010001000", lengths(6, 5),
       "runtime: the IRs of the chain have 10 bits together, the board file says 11"},
      {fpga + cpld, "1010001000", lengths(7, 3),
       "runtime: the IR of device 1 does not begin with 1 and 0 where the board file has it"},
      {"", "", "", "runtime: no device answers on the chain, TDO is all ones"},
      {std::string(probe, '0'), "", "", "runtime: no device answers on the chain, TDO is all zeros"},
      {noise, "", "",
       "runtime: the chain has no end: after 65 devices TDO does not bring back what TDI was given"},
      {fpga, "000000", "", silent},
      {fpga, std::string(QorRT::mostIrBits + 1, '1'), "", silent},
  };
  for (const auto& each : cases) EXPECT_EQ(chainSeen(each.idcodes, each.irs, each.board), each.seen);
}

std::string opcodeText(std::uint64_t opcode) {
  return opcode == ~std::uint64_t{0} ? "none" : std::to_string(opcode);
}

std::string laidOver(const std::string& board) {
  std::string text;
  const std::string thrown = thrownBy([&] {
    for (const QorRT::WireDevice& device : QorRT::describedDevices(
             {{0x11, "device0", 6}, {0x23, "device1", 0}}, QorRT::boardDevicesOf(board, "b.toml")))
      text += device.head.name + "/" + std::to_string(device.head.irLength) + "/" +
              opcodeText(device.userOpcodes[0]) + "," + opcodeText(device.userOpcodes[3]) + " ";
  });
  return thrown == "nothing" ? text : thrown;
}

TEST(BoardFacts, AreLaidOverWhatWasFoundAndMayNotContradictIt) {
  const std::string rest = "[[device]]\nir_length = 5\n";
  const std::pair<std::string, std::string> cases[] = {
      {"[[device]]\nname = \"fpga\"\nuser_opcodes = [0x22, 0x23]\nidcode = 0x11\n[[device]]\nir_length = 2\n",
       "fpga/6/34,none device1/2/2,none "},
      {"[[device]]\n[[device]]\n",
       "runtime: the IR length of device 1, IDCODE 00000023, cannot be seen in its capture; a board file "
       "can "
       "say it"},
      {rest, "runtime: the chain has 2 devices, the board file says 1"},
      {rest + rest, "runtime: device 0 has an IR of 6 bits, the board file says 5"},
      {"[[device]]\nidcode = 0x12\n" + rest,
       "runtime: device 0 has the IDCODE 00000011, the board file says 00000012"},
      {"[[device]]\nuser_opcodes = [64]\n" + rest,
       "runtime: device 0 has an IR of 6 bits, too short for the opcode 64 of a user register"},
      {"[[device]]\nuser_opcodes = [1, -2]\n",
       "runtime: b.toml:2: device[0].user_opcodes[1]: must be 0 to 4294967295, is -2"},
      {"[[device]]\nuser_opcodes = []\n",
       "runtime: b.toml:2: device[0].user_opcodes: must be the opcodes of 1 to 4 user registers, is 0"},
      {"[[device]]\nspeed = 3\n", "runtime: b.toml:2: device[0].speed: is no key of a board file"},
  };
  for (const auto& [board, result] : cases) EXPECT_EQ(laidOver(board), result) << board;
}

const char* const header =
    "   TapName             Enabled  IdCode     Expected   IrLen IrCap IrMask\n"
    "-- ------------------- -------- ---------- ---------- ----- ----- ------\n";
const std::string fpgaRow = " 0 fpga.tap               Y     0x0a5f1093 0x0a5f1093     6 0x01  0x03\n";
const std::string cpldRow = " 1 cpld.tap               Y     0x1234567b 0x1234567a     8 0x01  0x03\n";
const std::string alsoRow = "                                           0x1234567b\n";
const std::string versionRow = " 1 cpld.tap               Y     0x5234567b 0x*234567b     8 0x01  0x03\n";
const std::string anyRow = "                                           0x00000000\n";
const std::string offRow = " 2 dap.tap                N     0x00000000 0x00000000     4 0x01  0x03\n";
const std::string autoRow = " 2 auto0.tap              Y     0x4ba00477 0x00000000     4 0x00  0x00\n";

std::string tapsSeen(const std::string& table, const std::vector<std::string>& named = {}) {
  std::string text;
  std::vector<DeviceEntry> board(named.size());
  for (std::size_t i = 0; i < named.size(); ++i) board[i].tap = named[i];
  const std::string thrown = thrownBy([&] {
    const std::vector<OpenOcdTap> taps = QorRT::tapsIn(table);
    QorRT::requireTaps(taps, board);
    for (const OpenOcdTap& tap : taps)
      text += tap.name + "/" + QorRT::idcodeText(tap.idcode) + "/" + std::to_string(tap.irLength) + " ";
  });
  return thrown == "nothing" ? text : thrown;
}

TEST(TapTables, AreReadRowByRowAndHeldAgainstTheBoard) {
  const std::string both = header + fpgaRow + cpldRow + alsoRow;
  EXPECT_EQ(tapsSeen(both + offRow, {"fpga.tap", ""}), "fpga.tap/0A5F1093/6 cpld.tap/1234567B/8 ");
  EXPECT_EQ(tapsSeen(header + versionRow), "cpld.tap/5234567B/8 ");
  EXPECT_EQ(tapsSeen(header + cpldRow + anyRow), "cpld.tap/1234567B/8 ");
  EXPECT_EQ(tapsSeen(header + fpgaRow + cpldRow),
            "runtime: the TAP cpld.tap has the IDCODE 1234567B, not 1234567A");
  EXPECT_EQ(tapsSeen(header + fpgaRow + autoRow),
            "runtime: the chain has a device that the server's configuration does not name: auto0.tap, "
            "IDCODE 4BA00477, "
            "an IR of 4 bits by its capture");
  const std::string has =
      "runtime: the server has the TAPs fpga.tap, cpld.tap, the one nearest to TDO first; ";
  EXPECT_EQ(tapsSeen(both, {"cpld.tap"}), has + "the board file has another order: cpld.tap as device 0");
  EXPECT_EQ(tapsSeen(both, {"", "asic.tap"}), has + "the board file names asic.tap as device 1");
  EXPECT_EQ(tapsSeen("invalid command name \"scan_chain\""),
            "runtime: the server has no TAP on its scan chain");
  EXPECT_EQ(tapsSeen(" 0 a.tap Y 0x1z 0x00000000 6 0x01 0x03\n"),
            "runtime: the server's table of its scan chain has \"0x1z\" where a number is due");
}

TEST(Batches, AreOneScriptWithScansInFields) {
  const std::vector<OpenOcdTap> taps{{"a.tap", 0, {}, 6}, {"b.tap", 0, {}, 8}};
  const std::vector<WireDevice> devices{{{0, "", 6}}, {{0, "", 8}, {2, 3, 4, QorRT::noOpcode}}};
  Qor_Scan ir{Qor_Scan::Kind::ir}, wide{Qor_Scan::Kind::dr}, idle{Qor_Scan::Kind::idle};
  ir.device = wide.device = 1;
  ir.userChain = 4;
  wide.bitCount = 260;
  wide.out = Bytes(33, 0xA5);
  wide.out.back() = 0x09;
  idle.cycles = 8;
  std::string field;
  for (int i = 0; i < 32; ++i) field += "a5";
  const std::string fields = "drscan b.tap 256 0x" + field + " 4 0x09";
  const auto step = [&](const Qor_Scan& scan) { return QorRT::stepCommand(taps, devices, scan); };
  EXPECT_EQ(step(ir) + "/" + step(wide) + "/" + step(idle), "irscan b.tap 255/" + fields + "/runtest 8");
  EXPECT_EQ(QorRT::batchOf({{"a", 0}, {"b", 8}}), "a\nb\n");
  EXPECT_EQ(QorRT::batchOf({{"a", 8}, {"b", 8}}), "set r ok\nappend r { } [a]\nappend r { } [b]\nset r");
  EXPECT_EQ(QorRT::batchOf({{"a", 8}, {"b", 0}}), "set r ok\nappend r { } [a]\nb\nset r");
  EXPECT_EQ(QorRT::batchOf({{"a", 0}}), "set r ok\na\nset r");
}

std::string read(const std::string& answer, std::size_t bitCount) {
  std::string digits;
  const std::string thrown = thrownBy([&] {
    CaptureReader captures(answer);
    digits = hexOf(bitsOfBytes(captures.next(bitCount), bitCount));
    captures.finish();
  });
  return thrown == "nothing" ? digits : thrown;
}

TEST(Captures, AreReadStrictly) {
  const std::string field = "0" + std::string(62, '7') + "F";
  EXPECT_EQ(read("ok 0ab3 ", 12), "AB3");
  EXPECT_EQ(read("AB3", 12), "AB3");
  EXPECT_EQ(read(field + "\n 05\n", 259), "5" + field);
  const std::pair<const char*, const char*> bad[] = {
      {"invalid command name", "the server could not run the scans: invalid command name"},
      {"", "the server could not run the scans: has it lost its adapter?"},
      {"ag3", "the server could not run the scans: ag3"},
      {"ok", "the server answered \"\" where 12 bits were due"},
      {"b3", "the server answered \"b3\" where 12 bits were due"},
      {"ok 00ab3", "the server answered \"00ab3\" where 12 bits were due"},
      {"1ab3", "the server answered \"1ab3\" where 12 bits were due"},
      {"ok ab3 00", "the server answered more than it was asked: \"00\""},
  };
  for (const auto& [answer, problem] : bad)
    EXPECT_EQ(read(answer, 12), "runtime: " + std::string(problem)) << answer;
}

}  // namespace
