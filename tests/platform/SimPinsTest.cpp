// The simulated chain behind its wires: what IEEE 1149.1 asks of a TAP controller.
#include <gtest/gtest.h>

#include "ChainScan.h"
#include "tests/platform/SimHost.h"

namespace {

using qorsim::chain;
using qorsim::vio;

const std::string reset = "11111", toShiftDr = "0100", toShiftIr = "01100", toIdle = "10";

/// Moves the wires. Texts of TMS and of bits are in wire order; a bit comes out the same before and after TCK rises.
class PinHost {
 public:
  explicit PinHost(qorsim::Pins& pins) : pins_(pins) {}

  char clock(bool tms, bool tdi) {
    pins_.write(false, tms, tdi);
    const bool before = pins_.tdo();
    pins_.write(true, tms, tdi);
    EXPECT_EQ(pins_.tdo(), before);
    return before ? '1' : '0';
  }

  void walk(const std::string& tms) {
    for (const char each : tms) clock(each == '1', true);
    pins_.write(false, true, true);
  }

  /// In a Shift state, which the last bit leaves; with a pause after every `pauses` bits, unless that is 0.
  std::string shift(const std::string& bits, std::size_t pauses = 0) {
    std::string out;
    for (std::size_t i = 0; i < bits.size(); ++i) {
      const bool last = i + 1 == bits.size(), pause = !last && pauses != 0 && i % pauses == 0;
      out += clock(last || pause, bits[i] == '1');
      if (pause) walk("0010");
    }
    return out;
  }

  /// The first 32 bits of a DR scan from Run-Test/Idle or Test-Logic-Reset, and there again.
  std::string idcode() {
    walk(toShiftDr);
    const std::string out = shift(std::string(32, '1'));
    walk(toIdle);
    return hexOf(out);
  }

 private:
  qorsim::Pins& pins_;
};

TEST(SimPins, deliversIdcodesAfterResetAndWhatWentInBehindThem) {
  const auto pins = qorsim::demoBoard().device().pins();
  PinHost host(*pins);
  host.walk(reset + toShiftDr);
  const std::string bits = noise(120);
  EXPECT_EQ(host.shift(bits), bitsOf(0x0A5F1093, 32) + bitsOf(0x1234567B, 32) + "0" + bits.substr(0, 55));
}

TEST(SimPins, scansAsTheCableDoesWithAndWithoutPauses) {
  const auto core = vio().asyncOut(5).syncOut(3).asyncIn(9).syncIn(3).design(qorsim::loopback());
  const auto board = [&] { return chain().device(7).irLength(9).device(5).core(2, 3, core).device(); };
  for (const unsigned pauses : {0U, 1U, 5U}) {
    const auto cable = board().cable();
    const auto pins = board().pins();
    PinHost host(*pins);
    host.walk(reset + "0");
    for (const unsigned device : {1U, 1U, 0U, 2U}) {
      const SimHost frames(*cable, device, 2, 3);
      const QorRT::ChainScan ir = QorRT::chainIrScan(cable->devices(), device, 3);
      host.walk("1100");
      host.shift(bitsOfBytes(ir.bits, ir.bitCount), pauses);
      host.walk(toIdle);
      for (const unsigned code : {2U, 0xFU, 3U, 0U, 9U}) {
        const Bits frame = frames.frame(frames.header(code, 1), code == 2 ? noise(2 * 5 + 17 * 3) : "");
        const Bits bits = frame + Bits(200, '1');
        const std::size_t scan = cable->scanDr(device, bytesOf(bits), bits.size(), true);
        cable->idle(8);
        const QorRT::ChainScan dr = QorRT::chainDrScan(3, device, bytesOf(bits), bits.size());
        host.walk("100");
        const std::string out = host.shift(bitsOfBytes(dr.bits, dr.bitCount), pauses);
        host.walk(toIdle + "00000000");
        EXPECT_EQ(QorRT::chainDrCapture(device, bytesOf(out), bits.size()), cable->captured(scan))
            << device << " " << code;
      }
    }
  }
}

TEST(SimPins, ticksTheDesignClockWhileItStaysInRunTestIdle) {
  const std::pair<std::string, unsigned> cases[] = {
      {"1111", 0},      {"0", 0},        {"01", 0},         {"0000", 3},        {"0011111", 1},
      {"001001100", 2}, {"00101100", 2}, {"0010101100", 2}, {"00110101100", 2},
  };
  for (const auto& [tms, ticks] : cases) {
    for (const unsigned divisor : {1U, 2U}) {
      unsigned clocks = 0;
      const auto design = qorsim::callback([&](qorsim::Ports&) { ++clocks; });
      const auto pins = chain().tcksPerClock(divisor).device().core(1, 0, vio().design(design)).pins();
      PinHost(*pins).walk(tms);
      EXPECT_EQ(clocks, ticks / divisor) << tms;
    }
  }
}

TEST(SimPins, updatesWhatItHoldsHoweverTheScanEnded) {
  const std::string bypass = toShiftIr + std::string(6, '0') + "1" + toIdle;
  const struct {
    std::string walk, idcode;
  } cases[] = {
      {"", "0A5F1093"},                         // selected at power-up
      {bypass, "FFFFFFFE"},                     // TDI is 1 throughout
      {bypass + reset, "0A5F1093"},             //
      {bypass + "0110110", "0A5F1093"},         // captured and updated, without a shift
      {toShiftIr + "11111", "0A5F1093"},        // by Update-IR to Test-Logic-Reset
      {toShiftIr + "01" + toIdle, "FFFFFFFE"},  // some bits of what was captured stay
  };
  for (const auto& each : cases) {
    const auto pins = chain().device(0x0A5F1093).pins();
    PinHost host(*pins);
    host.walk(each.walk);
    EXPECT_EQ(host.idcode(), each.idcode) << each.walk;
  }
}

// What is obeyed is so in the TCK after the last bit of the frame, wherever that leads; TRST resets the TAP alone.
TEST(SimPins, obeysAWriteInTheTckAfterItsLastBit) {
  for (const bool trst : {false, true}) {
    bool output = false;
    const auto design = qorsim::callback([&](qorsim::Ports& ports) { output = ports.asyncOut[0] != 0; });
    const auto pins =
        chain().device(0x0A5F1093).irLength(4).core(1, 0, vio().asyncOut(1).design(design)).pins();
    const auto cable = chain().device().core(1, 0, vio()).cable();
    const SimHost frames(*cable);
    PinHost host(*pins);
    host.walk(toShiftIr);
    host.shift(bitsOf(2, 4));
    host.walk(toIdle + "100");
    host.shift(frames.frame(frames.header(2, 1), "11"));
    pins->setTrst(trst);
    host.walk("1");
    pins->setTrst(false);
    host.walk(trst ? "000" : "000011");
    EXPECT_EQ(output, true) << trst;
  }
}

TEST(SimPins, changesTdoWhenTckFallsAndLeavesItHighOutsideShift) {
  const auto pins = chain().device().pins();
  std::string seen;
  const std::string tms = toShiftDr + "0110", tdi = "00001000";
  for (std::size_t i = 0; i < tms.size(); ++i) {
    for (const bool tck : {true, false}) {
      pins->write(tck, tms[i] == '1', tdi[i] == '1');
      seen += pins->tdo() ? '1' : '0';
    }
  }
  EXPECT_EQ(seen, "1111111001111111");
  PinHost(*pins).walk("100");
  EXPECT_FALSE(pins->tdo());
  pins->setTrst(true);
  EXPECT_TRUE(pins->tdo());
}

}  // namespace
