#include "tools/qorvio/terminal/WatchTables.h"

#include "tools/qorvio/terminal/Arrow.h"

namespace qor::tool {

InputTable::InputTable(const InputWatch& watch)
    : table_({"INPUT", "VALUE", "ACTIVITY", "SYNC", "SINCE START"}) {
  for (const Signal& each : watch.inputs()) table_.add({each.name});
}

const std::vector<std::string>& InputTable::lines(InputWatch& watch, std::size_t width) {
  Bytes value;
  for (std::size_t i : watch.takeChanged()) {
    const Signal& input = watch.inputs()[i];
    extract(input, watch.sample(input).values(input.port), value);
    const Activity now = activityOf(input, watch.sample(input)),
                   ever = activityOf(input, watch.sinceStart(input));
    table_.set(i + 1, {input.name, shown(input, value), arrow(now.up, now.down),
                       input.port == Port::syncIn ? arrow(now.syncUp, now.syncDown) : "",
                       arrow(ever.up, ever.down)});
  }
  return table_.lines(width);
}

OutputTable::OutputTable(Board& board) : board_(board), table_({"  OUTPUT", "LAST GIVEN"}) {
  for (const Signal& each : board.signals().select({}, Direction::output)) addBits(board.signals(), each);
  for (std::size_t i = 0; i < outputs_.size(); ++i) {
    table_.add({});
    format(i);
  }
}

// Keys drive single bits: the bits of wider outputs one by one.
void OutputTable::addBits(const SignalTable& signals, const Signal& output) {
  if (output.width() == 1) return outputs_.push_back(output);
  for (unsigned bit = 0; bit < output.width(); ++bit)
    outputs_.push_back(signals.find(output.name + "[" + std::to_string(bit) + "]", Direction::output));
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

void OutputTable::write(const Assignment& assignment) {
  board_.give({assignment});
  board_.rememberOutputs();
  for (std::size_t i = 0; i < outputs_.size(); ++i) format(i);  // one bit may have several names
}

}  // namespace qor::tool
