// Values as texts and numbers, and back.
#include "board/model/Value.h"

#include <gtest/gtest.h>

#include <numeric>

#include "board/model/Errors.h"
#include "board/model/Letters.h"
#include "board/model/SignalTable.h"
#include "board/session/CableUrl.h"

namespace {

using qor::Radix;
using qor::Signal;
using qor::Value;

Signal signalOf(unsigned width, Radix radix = Radix::hex, double scale = 0, std::string unit = "") {
  Signal signal{"s", qor::Port::asyncOut};
  signal.bits.resize(width);
  std::iota(signal.bits.begin(), signal.bits.end(), 0U);
  signal.radix = radix;
  signal.scale = scale;
  signal.unit = std::move(unit);
  return signal;
}

Signal enumerated() {
  Signal signal = signalOf(4);
  signal.names = {{"RUN", 2}, {"fade", 3}};
  return signal;
}

struct Row {
  Signal signal;
  Value given;
  const char* shown = "";  ///< what it is shown as, or what is wrong with it
};

const Signal volts = signalOf(4, Radix::signedDec, 0.5, "V"), celsius = signalOf(8, Radix::dec, -0.1, "°C");
const std::string millions(3000000, '9');

const Row rows[] = {
    {signalOf(8), "5A", "0x5A"},
    {signalOf(8), "0d200", "0xC8"},
    {signalOf(8), "0b1010_0101", "0xA5"},
    {signalOf(8), -1, "0xFF"},
    {signalOf(1), true, "0x1"},
    {signalOf(8), 0x1FF, "s has 8 bits, too few for the value: 511"},
    {signalOf(8), "1FF", "s has 8 bits, too few for the value: 1FF"},
    {signalOf(8), "5G", "not a value for s, whose radix is hex: 5G"},
    {signalOf(8), 2.5, "not a value for s, whose radix is hex: 2.5"},
    {signalOf(8), "", "not a value for s, whose radix is hex: "},
    {signalOf(8, Radix::signedDec), -128, "-128"},
    {signalOf(8, Radix::signedDec), 128, "s has 8 bits, too few for the value: 128"},
    {signalOf(8, Radix::signedDec), "0x80", "-128"},
    {signalOf(8, Radix::signedDec), -129, "s has 8 bits, too few for the value: -129"},
    {signalOf(8, Radix::dec, 0, "rpm"), "12", "12 rpm"},
    {signalOf(8, Radix::dec, 0, "rpm"), "12rpm", "12 rpm"},
    {signalOf(100, Radix::dec), "1267650600228229401496703205375", "1267650600228229401496703205375"},
    {signalOf(100, Radix::dec), "1000000000000000000000000000000", "1000000000000000000000000000000"},
    {signalOf(100, Radix::dec), "1267650600228229401496703205376",
     "s has 100 bits, too few for the value: 1267650600228229401496703205376"},
    {signalOf(12), qor::Bytes{0xCD, 0xA}, "0xACD"},
    {signalOf(4), qor::Bytes{0x1F}, "s has 4 bits, too few for the value: 0x1F"},
    {volts, "1.5 V", "1.5 V"},
    {volts, "-4V", "-4 V"},
    {volts, 1.3, "1.5 V"},
    {volts, 3, "3 V"},
    {volts, "3", "3 V"},
    {volts, "0x3", "1.5 V"},
    {volts, "4 V", "s has 4 bits, too few for the value: 4 V"},
    {volts, "1.5 A", "not a value for s, whose radix is signed: 1.5 A"},
    {volts, std::string("1e999"), "not a value for s, whose radix is signed: 1e999"},
    {celsius, 0, "0 °C"},
    {celsius, -0.3, "-0.3 °C"},
    {enumerated(), "RUN", "RUN"},
    {enumerated(), "3", "fade"},
    {enumerated(), "f", "0xF"},
    {enumerated(), "STOP", "not a value for s, whose radix is hex, nor one of RUN fade: STOP"},
};

TEST(Value, IsReadAndShown) {
  for (const Row& row : rows) {
    std::string shown;
    try {
      shown = qor::shown(row.signal, row.given.bitsFor(row.signal));
    } catch (const qor::WrongUse& error) {
      shown = error.what();
    }
    EXPECT_EQ(shown, row.shown) << row.given.text();
  }
}

// Ten digits a bit would take minutes if the time grew with their square.
TEST(Value, OfMillionsOfDigitsIsRefusedAtOnce) {
  const Signal wide = signalOf(65535, Radix::dec);
  EXPECT_THROW(qor::parseValue(wide, "0d" + millions), qor::WrongUse);
  EXPECT_EQ(
      qor::shown(wide, qor::parseValue(wide, "0d" + std::string(3000000, '0') + millions.substr(0, 19000))),
      millions.substr(0, 19000));
}

TEST(SignalTable, SlicesHaveNoSign) {
  qor::SignalTable table;
  table.add(signalOf(4, Radix::signedDec));
  EXPECT_EQ(qor::shown(table.find("s[3:2]", qor::Direction::output), {3}), "3");
}

TEST(Letters, TellNamesFromOthers) {
  for (const char* name : {"a", "leds_0", "bus/a-b", "Zähler", "計數"})
    EXPECT_TRUE(qor::isSignalName(name)) << name;
  for (const char* name :
       {"", "$end", "$(id)", "a b", "a.b", "a[0]", "a=b", "a\302\240b", "\342\200\256a", "\xFF", "\xC3"})
    EXPECT_FALSE(qor::isSignalName(name)) << name;
  EXPECT_FALSE(qor::hasControls("°C, 50 %"));
  for (const char* text : {"\033[31m", "a\n", "\302\2332J", "\x7F", "\xC3("})
    EXPECT_TRUE(qor::hasControls(text));
}

TEST(CableUrl, NamesABoardInOneWay) {
  const char* const pairs[][2] = {
      {"rbb:localhost:9824", "rbb:127.0.0.1:9824"},
      {"RBB:LocalHost:09824?timeout=1", "rbb:127.0.0.1:9824"},
      {"rbb:Lab-PC:9824?board=b.toml", "rbb:lab-pc:9824"},
      {"openocd:", "openocd:127.0.0.1:6666"},
      {"openocd:localhost?timeout=3", "openocd:127.0.0.1:6666"},
      {"openocd:?timeout=3&config=/a/../b.cfg", "openocd:?config=/b.cfg"},
      {"sim:a.toml", "sim:a.toml"},
      {"lossy:6", "lossy:6"},
  };
  for (const auto& [url, name] : pairs) EXPECT_EQ(qor::boardName(url), name);
}

}  // namespace
