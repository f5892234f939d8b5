#include "board/model/SignalTable.h"

#include <algorithm>
#include <charconv>

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "platform/jtag/cable/Qor_Spelling.h"

namespace qor {
namespace {

char folded(char letter) {
  return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

std::string foldedName(std::string_view name) {
  std::string text(name);
  for (char& letter : text) letter = folded(letter);
  return text;
}

Direction directionOf(const Signal& signal) {
  return isInput(signal.port) ? Direction::input : Direction::output;
}

bool points(const Signal& signal, Direction direction) {
  return directionOf(signal) == direction;
}

const char* wordFor(Direction direction) {
  return direction == Direction::input ? "input" : "output";
}

bool parseNumber(std::string_view text, unsigned& number) {
  const auto [rest, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  return error == std::errc() && rest == text.data() + text.size();
}

// The bits in the brackets after the name. They are no number of their own: a sign would be of the whole only.
Signal slice(const Signal& whole, std::string_view name, std::string_view inside) {
  const std::size_t colon = inside.find(':');
  unsigned high = 0, low = 0;
  const bool good =
      parseNumber(inside.substr(0, colon), high) &&
      (colon == inside.npos ? parseNumber(inside, low) : parseNumber(inside.substr(colon + 1), low));
  if (!good) throw WrongUse("not a bit or a range of bits in brackets: " + std::string(name));
  if (std::max(high, low) >= whole.width())
    throw WrongUse(whole.name + " has " + std::to_string(whole.width()) +
                   (whole.width() == 1 ? " bit" : " bits") + ": " + std::string(name));
  Signal part{whole.name + "[" + std::string(inside) + "]", whole.port, {}, whole.radix};
  if (part.radix == Radix::signedDec) part.radix = Radix::dec;
  part.core = whole.core;
  for (unsigned bit = low;; bit = bit < high ? bit + 1 : bit - 1) {
    part.bits.push_back(whole.bits[bit]);
    if (bit == high) return part;
  }
}

}  // namespace

std::size_t SignalTable::addCore(QOR_CORE_REF ref) {
  const auto place =
      std::find_if(cores_.begin(), cores_.end(), [&](QOR_CORE_REF each) { return isSame(each, ref); });
  const auto index = static_cast<std::size_t>(place - cores_.begin());
  if (place == cores_.end()) cores_.push_back(ref);
  return index;
}

void SignalTable::setFirstCore(QOR_CORE_REF ref) {
  if (cores_.empty()) cores_.push_back(ref);
  cores_.front() = ref;
}

bool SignalTable::add(Signal signal) {
  auto& places = places_[static_cast<unsigned>(directionOf(signal))];
  if (!places.emplace(foldedName(signal.name), signals_.size()).second) return false;
  signals_.push_back(std::move(signal));
  fileSignals_ = signals_.size();
  return true;
}

void SignalTable::addWholePorts(const QORVIO_CORE_INFO& info, std::size_t core) {
  const std::size_t before = fileSignals_;
  const std::string prefix = core == 0 ? "" : refText(cores_.at(core)) + "/";
  for (Port port : {Port::asyncOut, Port::syncOut, Port::asyncIn, Port::syncIn}) {
    Signal whole{prefix + wholePortName(port), port};
    whole.core = core;
    for (unsigned bit = 0; bit < widthOf(info, port); ++bit) whole.bits.push_back(bit);
    if (!whole.bits.empty()) add(std::move(whole));
  }
  fileSignals_ = before;
}

const Signal* SignalTable::exact(std::string_view name, Direction direction) const {
  const auto& places = places_[static_cast<unsigned>(direction)];
  const auto place = places.find(foldedName(name));
  return place != places.end() ? &signals_[place->second] : nullptr;
}

void SignalTable::failUnknown(std::string_view name, Direction direction) const {
  const Direction other = direction == Direction::input ? Direction::output : Direction::input;
  std::string hint;
  if (exact(name, other) != nullptr) {
    hint = std::string(" (it is an ") + wordFor(other) + ")";
  } else {
    std::vector<std::string_view> known;
    for (const Signal& each : signals_)
      if (points(each, direction)) known.push_back(each.name);
    hint = QorRT::didYouMean(name, known);
  }
  throw UnknownSignal(std::string("no ") + wordFor(direction) + " of that name" + hint + ": " +
                      std::string(name));
}

Signal SignalTable::find(std::string_view name, Direction direction) const {
  if (const Signal* signal = exact(name, direction)) return *signal;
  const std::size_t bracket = name.find('[');
  if (bracket == name.npos || name.back() != ']') failUnknown(name, direction);
  const Signal* whole = exact(name.substr(0, bracket), direction);
  if (whole == nullptr) failUnknown(name.substr(0, bracket), direction);
  return slice(*whole, name, name.substr(bracket + 1, name.size() - bracket - 2));
}

std::vector<Signal> SignalTable::select(const std::vector<std::string>& names, Direction direction) const {
  std::vector<Signal> chosen;
  chosen.reserve(names.size());
  for (const std::string& name : names) chosen.push_back(find(name, direction));
  if (!names.empty()) return chosen;
  const auto pick = [&](std::size_t first, std::size_t last) {
    for (std::size_t i = first; i < last; ++i)
      if (points(signals_[i], direction)) chosen.push_back(signals_[i]);
  };
  pick(0, fileSignals_);
  if (chosen.empty()) pick(fileSignals_, signals_.size());
  return chosen;
}

std::vector<std::string> signalsOutsideCore(const SignalTable& table,
                                            const std::vector<QORVIO_CORE_INFO>& infos) {
  std::vector<std::string> lines;
  for (std::size_t i = 0; i < table.fileSignals(); ++i) {
    const Signal& signal = table.signals()[i];
    const unsigned width = widthOf(infos.at(signal.core), signal.port);
    const unsigned highest = *std::max_element(signal.bits.begin(), signal.bits.end());
    if (highest < width) continue;
    lines.push_back(signal.name + ": bit " + std::to_string(highest) + " is beyond " + portName(signal.port) +
                    ", which has " + std::to_string(width) + (width == 1 ? " bit" : " bits"));
  }
  return lines;
}

}  // namespace qor
