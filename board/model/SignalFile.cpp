#include "board/model/SignalFile.h"

#include <algorithm>
#include <charconv>
#include <cmath>

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "board/model/Letters.h"
#include "board/model/TomlPlace.h"
#include "board/model/Value.h"

namespace qor {
namespace {

constexpr Port ports[] = {Port::asyncOut, Port::syncOut, Port::asyncIn, Port::syncIn};
constexpr unsigned widest = 65535;

Port portNamed(const TomlPlace& place) {
  const std::string text = place.text();
  for (Port port : ports)
    if (text == portName(port)) return port;
  place.fail("must be async_out, sync_out, async_in or sync_in, is \"" + text + "\"");
}

unsigned bitNumber(const TomlPlace& place, std::int64_t number) {
  if (number < 0 || number >= widest) place.fail("a bit is 0 to 65534, is " + std::to_string(number));
  return static_cast<unsigned>(number);
}

unsigned bitNumber(const TomlPlace& place, std::string_view text) {
  unsigned number = 0;
  const auto [rest, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || rest != text.data() + text.size())
    place.fail("must be a bit, a list of bits or a range such as \"7:4\", has \"" + std::string(text) + "\"");
  return bitNumber(place, std::int64_t{number});
}

// "7:4": the bit before the colon is the most significant one.
std::vector<unsigned> bitRange(const TomlPlace& place) {
  const std::string text = place.text();
  const std::size_t colon = text.find(':');
  const unsigned high = bitNumber(place, std::string_view(text).substr(0, colon));
  if (colon == text.npos) return {high};
  const unsigned low = bitNumber(place, std::string_view(text).substr(colon + 1));
  std::vector<unsigned> bits;
  for (unsigned bit = low;; bit = bit < high ? bit + 1 : bit - 1) {
    bits.push_back(bit);
    if (bit == high) return bits;
  }
}

std::vector<unsigned> bitsOf(const TomlPlace& place) {
  if (const auto* number = place.node().as_integer()) return {bitNumber(place, number->get())};
  const toml::array* const list = place.node().as_array();
  if (list == nullptr) return bitRange(place);
  std::vector<unsigned> bits;
  for (const toml::node& each : *list) {
    const auto* number = each.as_integer();
    if (number == nullptr) place.fail("must be a list of whole numbers");
    bits.push_back(bitNumber(place, number->get()));
  }
  if (bits.empty()) place.fail("names no bit");
  std::reverse(bits.begin(), bits.end());  // the first one is the most significant, as in a range
  return bits;
}

bool isTaken(const Signal& signal, std::uint64_t value) {
  return std::any_of(signal.names.begin(), signal.names.end(),
                     [&](const auto& each) { return each.second == value; });
}

void readEnumeration(const TomlPlace& place, Signal& signal) {
  for (const auto& [key, node] : place.table()) {
    const TomlPlace entry = place.at(key.str());
    const std::string name(key.str());
    const auto* number = node.as_integer();
    if (number == nullptr || number->get() < 0) entry.fail("must be a whole number from 0 on");
    const auto value = static_cast<std::uint64_t>(number->get());
    if (signal.width() < 64 && value >> signal.width() != 0)
      entry.fail("is too wide for " + std::to_string(signal.width()) + " bits");
    if (isTaken(signal, value)) entry.fail("has the value of another name: " + std::to_string(value));
    if (isNumber(name)) entry.fail("can be read as a number");
    if (name.empty() || hasControls(name)) entry.fail("must be a name without control characters");
    signal.names.emplace_back(name, value);
  }
}

Radix radixOf(const TomlPlace& place) {
  const std::string text = place.text();
  for (Radix radix : {Radix::hex, Radix::bin, Radix::dec, Radix::signedDec})
    if (text == radixName(radix)) return radix;
  place.fail("must be hex, bin, dec or signed, is \"" + text + "\"");
}

double scaleOf(const TomlPlace& place) {
  double scale = 0;
  if (const auto* number = place.node().as_floating_point())
    scale = number->get();
  else if (const auto* whole = place.node().as_integer())
    scale = static_cast<double>(whole->get());
  if (!std::isfinite(scale) || scale == 0) place.fail("must be a number other than 0");
  return scale;
}

std::string nameOf(const TomlPlace& place) {
  std::string text = place.text();
  if (!isSignalName(text)) place.fail("must be letters, digits, _, - and /, is \"" + text + "\"");
  return text;
}

std::string plainText(const TomlPlace& place) {
  std::string text = place.text();
  if (hasControls(text)) place.fail("must be a text without control characters");
  return text;
}

QOR_CORE_REF coreOf(const TomlPlace& place) {
  const std::string text = place.text();
  try {
    return parseRef(text);
  } catch (const WrongUse& error) {
    place.fail(error.what());
  }
}

// Which bit would be given two values, if any.
void requireDistinctBits(const TomlPlace& place, const Signal& signal) {
  std::vector<unsigned> bits = signal.bits;
  std::sort(bits.begin(), bits.end());
  const auto twice = std::adjacent_find(bits.begin(), bits.end());
  if (!isInput(signal.port) && twice != bits.end())
    place.fail("names bit " + std::to_string(*twice) + " of an output twice");
}

Signal readSignal(const TomlPlace& place) {
  place.requireKeys({"name", "port", "bits", "core", "radix", "enum", "scale", "unit", "description"});
  Signal signal;
  signal.name = nameOf(place.at("name"));
  signal.port = portNamed(place.at("port"));
  signal.bits = bitsOf(place.at("bits"));
  requireDistinctBits(place.at("bits"), signal);
  if (place.has("radix")) signal.radix = radixOf(place.at("radix"));
  if (place.has("enum")) readEnumeration(place.at("enum"), signal);
  if (place.has("scale")) signal.scale = scaleOf(place.at("scale"));
  if (place.has("unit")) signal.unit = plainText(place.at("unit"));
  if (place.has("description")) signal.description = plainText(place.at("description"));
  return signal;
}

void readSignals(const std::string& path, const toml::node& list, bool hasCore, SignalTable& table) {
  if (!list.is_array_of_tables())
    TomlPlace(path, list, "signal").fail("must be tables, each headed [[signal]]");
  for (const toml::node& each : *list.as_array()) {
    const TomlPlace place(path, each, "signal[" + std::to_string(table.signals().size()) + "]");
    Signal signal = readSignal(place);
    if (place.has("core")) {
      if (!hasCore && table.cores().empty() && !table.signals().empty())
        place.at("core").fail("is given, but the signals above have none, nor has the file");
      signal.core = table.addCore(coreOf(place.at("core")));
    } else if (!hasCore && !table.cores().empty()) {
      place.fail("has no core, nor has the file, but the signals above have one");
    }
    if (!table.add(std::move(signal))) place.at("name").fail("is there already: " + place.at("name").text());
  }
}

}  // namespace

SignalTable readSignalFile(const std::string& path) {
  const toml::table parsed = readToml(path);
  const TomlPlace root(path, parsed, "");
  root.requireKeys({"core", "signal"});
  SignalTable table(path);
  if (root.has("core")) table.setFirstCore(coreOf(root.at("core")));
  if (root.has("signal")) readSignals(path, root.at("signal").node(), root.has("core"), table);
  return table;
}

std::string firstSignalFile(QOR_CORE_REF ref, const QORVIO_CORE_INFO& info) {
  std::vector<Signal> signals;
  for (Port port : ports) {
    Signal signal{portName(port), port};
    for (unsigned bit = 0; bit < widthOf(info, port); ++bit) signal.bits.push_back(bit);
    if (signal.width() != 0) signals.push_back(std::move(signal));
  }
  return signalFileText(ref, signals);
}

std::string signalFileText(const std::optional<QOR_CORE_REF>& ref, const std::vector<Signal>& signals) {
  std::string text =
      "# Names for port bits. bits: one bit, a range such as \"7:4\", or a list, most significant first.\n"
      "# Also: radix = \"hex\" (bin, dec, signed), enum = { off = 0 }, scale = 0.5, unit = \"V\",\n"
      "# core = \"...\" (another one than the file's), description = \"...\".\n";
  if (ref) text += "core = \"" + refText(*ref) + "\"\n";
  for (const Signal& each : signals) {
    const std::string bits = bitsText(each.bits);
    const bool isList = bits.find(',') != bits.npos, isBit = each.width() == 1;
    text.append("\n[[signal]]\nname = \"")
        .append(each.name)
        .append("\"\nport = \"")
        .append(portName(each.port));
    text.append("\"\nbits = ")
        .append(isBit    ? bits
                : isList ? "[" + bits + "]"
                         : '"' + bits + '"')
        .append("\n");
  }
  return text;
}

}  // namespace qor
