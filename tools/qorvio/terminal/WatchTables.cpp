#include "tools/qorvio/terminal/WatchTables.h"

#include <utility>

#include "tools/qorvio/terminal/Arrow.h"

namespace qor::tool {

namespace {

constexpr std::size_t longestHistory = 24;  // frames

std::string drawn(const std::string& levels) {
  constexpr const char* bars[] = {"▁", "▂", "▃", "▄", "▅", "▆", "▇", "█"};
  std::string text;
  for (const char level : levels) text += bars[level - '0'];
  return text;
}

// The top three bits of a wide value; of a bit the lowest or the highest level.
char levelOf(const Signal& input, const Sample& sample) {
  unsigned level = 0;
  const unsigned width = input.width();
  for (unsigned i = 0; i < 3; ++i) {
    const unsigned bit = input.bits[width > i ? width - 1 - i : 0];
    level = level << 1 | bitAt(sample.values(input.port), bit);
  }
  return static_cast<char>('0' + level);
}

}  // namespace

InputTable::InputTable(const InputWatch& watch)
    : inputs_(watch.inputs().size()),
      table_({"INPUT", "VALUE", "ACTIVITY", "SYNC", "SINCE START"}),
      levels_(inputs_) {
  for (const Signal& each : watch.inputs()) table_.add({each.name});
}

void InputTable::keep(const InputWatch& watch) {
  for (std::size_t i = 0; i < inputs_; ++i) {
    if (levels_[i].size() == longestHistory) levels_[i].erase(0, 1);
    levels_[i] += levelOf(watch.inputs()[i], watch.sample(watch.inputs()[i]));
  }
}

void InputTable::showHistory(bool isShown) {
  showsHistory_ = isShown;
  isOtherwise_ = true;
  if (isShown) {
    table_.set(0, {"INPUT", "VALUE", "ACTIVITY", "SYNC", "SINCE START", "LATEST"});
  } else {
    table_.set(0, {"INPUT", "VALUE", "ACTIVITY", "SYNC", "SINCE START"});
  }
}

void InputTable::format(const InputWatch& watch, std::size_t i) {
  Bytes value;
  const Signal& input = watch.inputs()[i];
  extract(input, watch.sample(input).values(input.port), value);
  const Activity now = activityOf(input, watch.sample(input)),
                 ever = activityOf(input, watch.sinceStart(input));
  std::vector<Cell> row{input.name, shown(input, value), arrow(now.up, now.down),
                        input.port == Port::syncIn ? arrow(now.syncUp, now.syncDown) : "",
                        arrow(ever.up, ever.down)};
  if (showsHistory_) row.emplace_back(drawn(levels_[i]));
  table_.set(i + 1, std::move(row));
}

const std::vector<std::string>& InputTable::lines(InputWatch& watch, std::size_t width) {
  const std::vector<std::size_t> changed = watch.takeChanged();
  if (std::exchange(isOtherwise_, false) || showsHistory_) {
    for (std::size_t i = 0; i < inputs_; ++i) format(watch, i);
  } else {
    for (std::size_t i : changed) format(watch, i);
  }
  return table_.lines(width);
}

OutputTable::OutputTable(Board& board) : board_(board), table_({"  OUTPUT", "LAST GIVEN"}) {
  for (const Signal& each : board.signals().select({}, Direction::output)) addRows(board.signals(), each);
  for (std::size_t i = 0; i < outputs_.size(); ++i) {
    table_.add({});
    format(i);
  }
}

void OutputTable::addRows(const SignalTable& signals, const Signal& output) {
  outputs_.push_back(output);
  if (output.width() == 1 || output.width() > widestWithBits) return;
  for (unsigned bit = 0; bit < output.width(); ++bit)
    outputs_.push_back(signals.find(output.name + "[" + std::to_string(bit) + "]", Direction::output));
}

void OutputTable::choose(const std::string& name) {
  for (std::size_t i = 0; i < outputs_.size(); ++i)
    if (outputs_[i].name == name) choose(i);
}

void OutputTable::choose(std::size_t index) {
  if (index >= outputs_.size()) return;  // before the first one, too
  format(std::exchange(chosen_, index));
  format(chosen_);
}

void OutputTable::format(std::size_t index) {
  const Signal& output = outputs_[index];
  const std::optional<Bytes> last = board_.lastGiven(output);
  table_.set(index + 1, {(index == chosen_ ? "> " : "  ") + output.name, last ? shown(output, *last) : "?"});
}

void OutputTable::toggleChosen() {
  if (outputs_.empty()) return;
  // Where the last value is not known, the table shows what a first key makes of it.
  write(toggled(board_.core(outputs_[chosen_].core), outputs_[chosen_], false));
}

void OutputTable::pulseChosen() {
  if (!outputs_.empty()) write(pulseOf(outputs_[chosen_], {}));
}

void OutputTable::giveChosen(const std::string& text) {
  if (outputs_.empty()) return;
  const std::string name = chosen() + (text.find(',') == text.npos ? "=" : ".pulsetrain=");
  write(assignmentsOf({parseDrive(name + text)}, board_.signals()).front());
}

void OutputTable::write(const Assignment& assignment) {
  board_.give({assignment});
  board_.rememberOutputs();
  for (std::size_t i = 0; i < outputs_.size(); ++i) format(i);  // one bit may have several names
}

}  // namespace qor::tool
