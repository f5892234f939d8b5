// The simulated chain behind its wires: what IEEE 1149.1 asks of a TAP controller.
#include <gtest/gtest.h>

#include "ChainScan.h"
#include "tests/platform/SimHost.h"

namespace {

using qorsim::chain;

const std::string reset = "11111", toShiftDr = "100", toShiftIr = "1100", toIdle = "10";

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

  /// In a Shift state, and back to Run-Test/Idle; with a pause after every `pauses` bits, unless that is 0.
  std::string shift(const std::string& bits, std::size_t pauses = 0) {
    std::string out;
    for (std::size_t i = 0; i < bits.size(); ++i) {
      const bool last = i + 1 == bits.size(), pause = !last && pauses != 0 && i % pauses == 0;
      out += clock(last || pause, bits[i] == '1');
      if (pause) walk("0010");
    }
    walk(toIdle);
    return out;
  }

 private:
  qorsim::Pins& pins_;
};

// The inputs count the design clocks since the output was set.
TEST(SimPins, scansAsTheCableDoesWithAndWithoutPauses) {
  const auto board = [] {
    const auto design = qorsim::callback([count = 0U](qorsim::Ports& ports) mutable {
      count += ports.asyncOut[0];
      for (unsigned i = 0; i < 9; ++i) ports.asyncIn[i] = count >> i & 1;
    });
    const auto core = qorsim::vio().asyncOut(1).asyncIn(9).design(design);
    return chain().device(7).irLength(9).device(5).userOpcodes({7, 6}).core(2, 3, core).device();
  };
  for (const unsigned pauses : {0U, 1U, 5U}) {
    const auto cable = board().cable();
    const auto pins = board().pins();
    PinHost host(*pins);
    host.walk(reset + "0");
    for (const unsigned device : {1U, 1U, 0U, 2U}) {
      const SimHost frames(*cable, device, 2, 3);
      const QorRT::ChainScan ir = QorRT::chainIrScan(cable->devices(), device, device == 1 ? 6 : 3);
      host.walk(toShiftIr);
      host.shift(bitsOfBytes(ir.bits, ir.bitCount), pauses);
      const Bits read = frames.frame(frames.header(3, 1)) + Bits(120, '1');
      for (const Bits& bits : {frames.frame(frames.header(2, 1), "11"), read, read + "1"}) {
        const std::size_t scan = cable->scanDr(device, bytesOf(bits), bits.size(), true);
        cable->idle(8);
        const QorRT::ChainScan dr = QorRT::chainDrScan(3, device, bytesOf(bits), bits.size());
        host.walk(toShiftDr);
        const std::string out = host.shift(bitsOfBytes(dr.bits, dr.bitCount), pauses);
        host.walk("00000000");
        EXPECT_EQ(QorRT::chainDrCapture(device, bytesOf(out), bits.size()), cable->captured(scan));
      }
    }
  }
}

TEST(SimPins, updatesWhatItHoldsHoweverTheScanEnded) {
  const std::string bypass = "0" + toShiftIr + std::string(6, '0') + "1" + toIdle;
  const struct {
    bool trst;
    std::string walk, idcode;
  } cases[] = {
      {false, "0", "0A5F1093"},                   // selected at power-up
      {false, bypass, "FFFFFFFE"},                // TDI is 1 throughout
      {false, bypass + reset + "0", "0A5F1093"},  //
      {true, bypass, "0A5F1093"},                 //
      {false, bypass + "110110", "0A5F1093"},     // captured and updated, without a shift
      {false,
       "01100"
       "11111"
       "0",
       "0A5F1093"},  // by Update-IR to Test-Logic-Reset
      {false,
       "01100"
       "01" +
           toIdle,
       "FFFFFFFE"},  // some bits of what was captured stay
  };
  for (const auto& each : cases) {
    const auto pins = chain().device(0x0A5F1093).pins();
    PinHost host(*pins);
    host.walk(each.walk);
    pins->setTrst(each.trst);
    if (each.trst) host.walk("0"), pins->setTrst(false), host.walk("0");
    host.walk(toShiftDr);
    EXPECT_EQ(hexOf(host.shift(std::string(32, '1'))), each.idcode) << each.walk;
  }
}

TEST(SimPins, changesTdoWhenTckFallsAndLeavesItHighOutsideShift) {
  const auto pins = chain().device().pins();
  std::string seen;
  const std::string tms = "01000110", tdi = "00001000";
  for (std::size_t i = 0; i < tms.size(); ++i) {
    for (const bool tck : {true, false}) {
      pins->write(tck, tms[i] == '1', tdi[i] == '1');
      seen += pins->tdo() ? '1' : '0';
    }
  }
  EXPECT_EQ(seen, "1111111001111111");
}

}  // namespace
