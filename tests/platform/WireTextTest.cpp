// What the cables to servers read and write, without a server: URLs, board files, captures of an unknown chain,
// the texts of a Tcl port.
#include <gtest/gtest.h>

#include "ChainScan.h"
#include "QorJtag_Host.h"
#include "platform/jtag/cable/bitbang/TckSequence.h"
#include "platform/jtag/cable/openocd/OpenOcdText.h"
#include "platform/jtag/cable/wire/ChainProbe.h"
#include "platform/jtag/cable/wire/WireUrl.h"
#include "tests/platform/ThrownBy.h"
#include "tests/platform/WireBits.h"

namespace {

using QorRT::OpenOcdTap;
using QorRT::Qor_Device;
using QorRT::Qor_Scan;
using QorRT::WireDevice;
using Bytes = std::vector<unsigned char>;
using Rows = std::vector<std::pair<std::string, std::string>>;

TEST(WireUrls, NameAServerAndOptions) {
  const std::string noServer = "names no server: HOST:PORT is due, with a port of 1 to 65535",
                    noDigits = "has a \"%\" without two hexadecimal digits after it",
                    noTime = "has a timeout that is not 0 to 3600 seconds";
  const auto parsed = [](const std::string& rest) {
    const QorRT::WireUrl url = QorRT::parseWireUrl("rbb", rest, {"board", "config", "timeout"});
    return url.endpoint.text() + " " + url.config + " " + url.board + " " +
           std::to_string(url.timeout / QorRT::Seconds(0.5));
  };
  EXPECT_EQ(parsed("[::1]:9000?timeout=0.5&config=a%26b%3d%C3%A4.cfg&board=none.toml"),
            "::1:9000 a&b=\xC3\xA4.cfg none.toml 1.000000");
  const Rows bad = {
      {"host", noServer},
      {":1", noServer},
      {"host:65536", noServer},
      {"host:1?board", "gives the option \"board\" no value"},
      {"host:1?board=%2", noDigits},
      {"host:1?board=%2g", noDigits},
      {"host:1?speed=3", "has the unknown option \"speed\"; known: board, config, timeout"},
      {"host:1?timeout=0", noTime},
      {"host:1?timeout=1s", noTime},
  };
  for (const auto& [rest, problem] : bad)
    EXPECT_EQ(resultOf([&, &r = rest] { return parsed(r); }),
              "logic: the cable URL \"rbb:" + rest + "\" " + problem);
  for (const std::string url : {"rbb:host:1?config=a", "openocd:host:1?config=a"})
    EXPECT_EQ(
        thrownBy([&] { QorRT::openCable(url.c_str()); }),
        "logic: the cable URL \"" + url + "\" has the unknown option \"config\"; known: board, timeout");
}

// What an idle chain of that many bits shows a probe of ones: its own bits, then the probe.
Bytes idle(std::string wire, std::size_t bitCount) {
  wire.resize(bitCount, '1');
  return bytesOf(wire);
}

// The devices, with the IR lengths of the capture or, where it leaves them open, of the board file.
std::string chainSeen(const std::string& idcodes, const std::string& irs, const std::string& board) {
  std::vector<Qor_Device> found = QorRT::idcodesIn(idle(idcodes, QorRT::idcodeProbe().bitCount));
  const Bytes captured = idle(irs + "0", QorRT::irProbe().bitCount);
  QorRT::readIrLengths(found, captured);
  if (!board.empty()) {
    const std::vector<WireDevice> devices =
        QorRT::describedDevices(found, QorRT::boardDevicesOf(board, "b.toml"));
    QorRT::requireIrs(devices, captured);
    for (std::size_t i = 0; i < found.size(); ++i) found[i] = devices[i].head;
  }
  std::string text;
  for (const Qor_Device& each : found)
    text += QorRT::idcodeText(each.idcode) + "/" + std::to_string(each.irLength) + " ";
  return text;
}

// What no chain of today asks for: a device alone with a scan of no bits, and an IR of more bits than an opcode has.
TEST(Scans, MayBeEmptyOrLongerThanAnOpcode) {
  QorRT::TckSequence empty;
  empty.scanDr({{}, 0}, true);
  std::string walk;
  for (const unsigned char tck : empty.tcks()) walk += (tck & QorRT::TckSequence::tms) != 0 ? '1' : '0';
  EXPECT_EQ(walk, "10110");  // select, capture, exit, update, idle
  EXPECT_EQ(QorRT::chainIrScan({{0, "long", 66}}, 0, ~1ull).bits,
            Bytes({254, 255, 255, 255, 255, 255, 255, 255, 3}));
}

TEST(Probes, ShowWhatIsOnAChainOrHowTdoIsStuck) {
  const std::string fpga = bitsOf(0x0A5F1093, 32), cpld = bitsOf(0x1234567B, 32);
  const std::size_t probe = QorRT::idcodeProbe().bitCount;
  const std::string silent =
      "runtime: the instruction registers of the chain do not answer: TDO brings back no 1 and 0";
  const auto lengths = [](int first, int second) {
    const std::string device = "[[device]]\nir_length=";
    return device + std::to_string(first) + "\n" + device + std::to_string(second);
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
  for (const auto& each : cases)
    EXPECT_EQ(resultOf([&] { return chainSeen(each.idcodes, each.irs, each.board); }), each.seen);
}

std::string laidOver(const std::string& board) {
  std::string text;
  for (const WireDevice& device : QorRT::describedDevices({{0x11, "device0", 6}, {0x23, "device1", 0}},
                                                          QorRT::boardDevicesOf(board, "b.toml"))) {
    text += device.head.name + "/" + std::to_string(device.head.irLength) + "/";
    for (const std::uint64_t opcode : device.userOpcodes)
      text += opcode == QorRT::noOpcode ? "- " : std::to_string(opcode) + " ";
  }
  return text;
}

TEST(BoardFacts, AreLaidOverWhatWasFoundAndMayNotContradictIt) {
  const std::string five = "[[device]]\nir_length = 5\n";
  const Rows rows = {
      {"[[device]]\nname = \"fpga\"\nuser_opcodes = [0x22, 0x23]\nidcode = 0x11\n[[device]]\nir_length = 2\n",
       "fpga/6/34 35 - - device1/2/2 3 - - "},
      {"[[device]]\n[[device]]\n",
       "runtime: the IR length of device 1, IDCODE 00000023, cannot be seen in its capture; a board file "
       "can say it"},
      {five, "runtime: the chain has 2 devices, the board file says 1"},
      {five + five, "runtime: device 0 has an IR of 6 bits, the board file says 5"},
      {"[[device]]\nidcode = 0x12\n" + five,
       "runtime: device 0 has the IDCODE 00000011, the board file says 00000012"},
      {"[[device]]\nuser_opcodes = [64]\n" + five,
       "runtime: device 0 has an IR of 6 bits, too short for the opcode 64 of a user register"},
      {"[[device]]\nuser_opcodes = [1, -2]\n",
       "logic: b.toml:2: device[0].user_opcodes[1]: must be 0 to 4294967295, is -2"},
      {"[[device]]\nuser_opcodes = []\n",
       "logic: b.toml:2: device[0].user_opcodes: must be the opcodes of 1 to 4 user registers, is 0"},
      {"[[device]]\nspeed = 3\n", "logic: b.toml:2: device[0].speed: is no key of a board file"},
      {"[[device]]\nuser_opcode = [3]\n",
       "logic: b.toml:2: device[0].user_opcode: is no key of a board file (did you mean user_opcodes?)"},
  };
  for (const auto& [board, result] : rows)
    EXPECT_EQ(resultOf([&, &b = board] { return laidOver(b); }), result);
}

const std::string fpgaRow = " 0 fpga.tap               Y     0x0a5f1093 0x0a5f1093     6 0x01  0x03\n";
const std::string cpldRow = " 1 cpld.tap               Y     0x1234567b 0x1234567a     8 0x01  0x03\n";

std::string tapsSeen(const std::string& table, const std::vector<std::string>& named) {
  const std::vector<OpenOcdTap> taps =
      QorRT::tapsIn("   TapName             Enabled  IdCode     Expected   IrLen IrCap IrMask\n" + table);
  std::vector<QorRT::DeviceEntry> board(named.size());
  for (std::size_t i = 0; i < named.size(); ++i) board[i].tap = named[i];
  QorRT::requireTaps(taps, board);
  std::string text;
  for (const OpenOcdTap& tap : taps)
    text += tap.name + "/" + QorRT::idcodeText(tap.idcode) + "/" + std::to_string(tap.irLength) + " ";
  return text;
}

TEST(TapTables, AreReadRowByRowAndComparedWithTheBoard) {
  const std::string also = "                                           0x1234567b\n";
  const std::string both = fpgaRow + cpldRow + also, cpld = "cpld.tap/1234567B/8 ";
  const std::string has =
      "runtime: the server has the TAPs fpga.tap, cpld.tap, the one nearest to TDO first; the board file ";
  const struct {
    std::string table;
    std::vector<std::string> named;
    std::string seen;
  } rows[] = {
      {both + " 2 dap.tap                N     0x00000000 0x00000000     4 0x01  0x03\n",
       {"fpga.tap", ""},
       "fpga.tap/0A5F1093/6 " + cpld},
      {" 1 cpld.tap               Y     0x1234567b 0x*234567b     8 0x01  0x03\n", {}, cpld},
      {cpldRow + "                                           0x00000000\n", {}, cpld},
      {cpldRow, {}, "runtime: the TAP cpld.tap has the IDCODE 1234567B, not 1234567A"},
      {both, {"cpld.tap"}, has + "has another order: cpld.tap as device 0"},
      {both, {"", "asic.tap"}, has + "names asic.tap as device 1"},
      {"invalid command name \"scan_chain\"", {}, "runtime: the server has no TAP on its scan chain"},
      {" 0 a.tap Y 0x1z 0x00000000 6 0x01 0x03\n",
       {},
       "runtime: the server's table of its scan chain has \"0x1z\" where a number is due"},
  };
  for (const auto& row : rows) EXPECT_EQ(resultOf([&] { return tapsSeen(row.table, row.named); }), row.seen);
}

TEST(Batches, AreOneScriptWithScansInFields) {
  const std::vector<OpenOcdTap> taps{{"a.tap", 0, {}, 6}, {"b.tap", 0, {}, 8}};
  const std::vector<WireDevice> devices{{{0, "", 6}}, {{0, "", 8}, {2, 3, 4, QorRT::noOpcode}}};
  Qor_Scan ir{Qor_Scan::Kind::ir}, wide{Qor_Scan::Kind::dr}, idle{Qor_Scan::Kind::idle};
  ir.device = wide.device = 1;
  ir.userChain = 4;
  wide.bitCount = 260;
  wide.out = Bytes(33, 0xAA);
  wide.out.back() = 0x09;
  idle.cycles = 8;
  const auto step = [&](const Qor_Scan& scan) { return QorRT::stepCommand(taps, devices, scan); };
  EXPECT_EQ(step(ir) + "/" + step(wide) + "/" + step(idle),
            "irscan b.tap 255/drscan b.tap 256 0x" + std::string(64, 'a') + " 4 0x09/runtest 8");
  EXPECT_EQ(QorRT::batchOf({{"a", 0}, {"b", 8}}), "a\nb\n");
  EXPECT_EQ(QorRT::batchOf({{"a", 8}, {"b", 8}}), "set r ok\nappend r { } [a]\nappend r { } [b]\nset r");
  EXPECT_EQ(QorRT::batchOf({{"a", 8}, {"b", 0}}), "set r ok\nappend r { } [a]\nb\nset r");
  EXPECT_EQ(QorRT::batchOf({{"a", 0}}), "set r ok\na\nset r");
}

std::string read(const std::string& answer, std::size_t bitCount) {
  return resultOf([&] {
    QorRT::CaptureReader captures(answer);
    const Bytes bits = captures.next(bitCount);
    captures.finish();
    return hexOf(bitsOfBytes(bits, bitCount));
  });
}

TEST(Captures, AreReadStrictly) {
  const std::string field = "0" + std::string(62, '7') + "F";
  EXPECT_EQ(read(field + "\n 05\n", 259), "5" + field);
  const Rows rows = {
      {"ok 0ab3 ", "AB3"},
      {"AB3", "AB3"},
      {"invalid command name", "runtime: the server could not run the scans: invalid command name"},
      {"", "runtime: the server could not run the scans: has it lost its adapter?"},
      {"ag3", "runtime: the server could not run the scans: ag3"},
      {"ok", "runtime: the server answered \"\" where 12 bits were due"},
      {"b3", "runtime: the server answered \"b3\" where 12 bits were due"},
      {"ok 00ab3", "runtime: the server answered \"00ab3\" where 12 bits were due"},
      {"1ab3", "runtime: the server answered \"1ab3\" where 12 bits were due"},
      {"ok ab3 00", "runtime: the server answered more than it was asked: \"00\""},
  };
  for (const auto& [answer, digits] : rows) EXPECT_EQ(read(answer, 12), digits) << answer;
}

}  // namespace
