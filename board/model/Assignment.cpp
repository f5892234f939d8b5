#include "board/model/Assignment.h"

#include <algorithm>

#include "board/model/Errors.h"

namespace qor {
namespace {

constexpr std::string_view trainSuffix = ".pulsetrain";

Assignment trainOf(const Signal& signal, const Train& train) {
  if (signal.port != Port::syncOut)
    throw WrongUse("an asynchronous output plays no pulse train: " + signal.name);
  if (train.values.empty() || train.values.size() > stepCount)
    throw WrongUse("a pulse train of " + signal.name + " has 1 to 16 values, not " +
                   std::to_string(train.values.size()));
  Assignment assignment{signal, {}};
  for (const Value& each : train.values) assignment.steps.push_back(each.bitsFor(signal));
  assignment.steps.resize(stepCount, Bytes(assignment.steps.back()));
  return assignment;
}

Assignment assignmentOf(const Drive& drive, const Signal& signal) {
  if (const auto* pulse = std::get_if<Pulse>(&drive.what)) return pulseOf(signal, *pulse);
  if (const auto* train = std::get_if<Train>(&drive.what)) return trainOf(signal, *train);
  return level(signal, std::get<Value>(drive.what).bitsFor(signal));
}

}  // namespace

std::vector<Assignment> assignmentsOf(const std::vector<Drive>& drives, const SignalTable& signals) {
  std::vector<Assignment> assignments;
  for (const Drive& drive : drives) {
    const Signal signal = signals.find(drive.name, Direction::output);
    const bool isTwice = std::any_of(assignments.begin(), assignments.end(),
                                     [&](const Assignment& each) { return each.signal.name == signal.name; });
    if (isTwice) throw WrongUse("an output is given two values: " + signal.name);
    assignments.push_back(assignmentOf(drive, signal));
  }
  return assignments;
}

Drive parseDrive(std::string_view text) {
  const std::size_t equals = text.find('=');
  if (equals == text.npos) throw WrongUse("not NAME=VALUE: " + std::string(text));
  std::string_view name = text.substr(0, equals), value = text.substr(equals + 1);
  if (name.size() <= trainSuffix.size() || name.substr(name.size() - trainSuffix.size()) != trainSuffix)
    return {std::string(name), Value(std::string(value))};
  name.remove_suffix(trainSuffix.size());
  Train train;
  for (std::size_t comma = 0; comma != value.npos; value.remove_prefix(comma == value.npos ? 0 : comma + 1)) {
    comma = value.find(',');
    train.values.emplace_back(std::string(value.substr(0, comma)));
  }
  return {std::string(name), std::move(train)};
}

Assignment level(const Signal& signal, Bytes value) {
  return {signal, {std::move(value)}};
}

Assignment pulseOf(const Signal& signal, Pulse pulse) {
  requireBit(signal);
  if (signal.port != Port::syncOut)
    throw WrongUse("an asynchronous output plays no pulses, press it instead: " + signal.name);
  if (pulse.width == 0) throw WrongUse("a pulse must be 1 to 15 steps wide: 0");
  if (pulse.at >= stepCount || pulse.width >= stepCount - pulse.at) {
    throw WrongUse("a pulse must begin and end within 16 steps, the last of them low: steps " +
                   std::to_string(pulse.at) + " to " +
                   std::to_string(std::uint64_t{pulse.at} + pulse.width - 1));
  }
  std::vector<Bytes> steps(stepCount, Bytes{0});
  for (unsigned step = pulse.at; step < pulse.at + pulse.width; ++step) steps[step] = {1};
  return {signal, steps};
}

void requireBit(const Signal& signal) {
  if (signal.width() == 1) return;
  throw WrongUse(signal.name + " has " + std::to_string(signal.width()) +
                 " bits; name one of them: " + signal.name + "[0]");
}

}  // namespace qor
