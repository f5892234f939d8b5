#include "tools/qorvio/Assignments.h"

#include <cstdio>
#include <string_view>

#include <nlohmann/json.hpp>

#include "board/model/Errors.h"

namespace qor::tool {
namespace {

constexpr std::string_view trainSuffix = ".pulsetrain";
constexpr std::size_t stepCount = 16;

std::vector<Bytes> parseTrain(const Signal& signal, std::string_view text) {
  if (signal.port != Port::syncOut)
    throw WrongUse("an asynchronous output plays no pulse train: " + signal.name);
  std::vector<Bytes> steps;
  for (std::size_t comma = 0; comma != text.npos; text.remove_prefix(comma == text.npos ? 0 : comma + 1)) {
    comma = text.find(',');
    steps.push_back(parseValue(signal, text.substr(0, comma)));
  }
  if (steps.size() > stepCount)
    throw WrongUse("a pulse train of " + signal.name + " has 16 values at most, not " +
                   std::to_string(steps.size()));
  steps.resize(stepCount, Bytes(steps.back()));
  return steps;
}

}  // namespace

Assignment parseAssignment(const SignalTable& signals, const std::string& text) {
  const std::size_t equals = text.find('=');
  if (equals == text.npos) throw WrongUse("not NAME=VALUE: " + text);
  std::string_view name = std::string_view(text).substr(0, equals);
  const std::string_view value = std::string_view(text).substr(equals + 1);
  const bool isTrain =
      name.size() > trainSuffix.size() && name.substr(name.size() - trainSuffix.size()) == trainSuffix;
  if (isTrain) name.remove_suffix(trainSuffix.size());
  const Signal signal = signals.find(name, Direction::output);
  if (isTrain) return {signal, parseTrain(signal, value)};
  return level(signal, parseValue(signal, value));
}

void printWritten(const Context& context, const std::vector<Assignment>& assignments) {
  if (!context.settings.json) return;
  nlohmann::ordered_json json = nlohmann::ordered_json::array();
  for (const Assignment& each : assignments) {
    nlohmann::ordered_json steps = nlohmann::ordered_json::array();
    for (const Bytes& step : each.steps) steps.push_back(hexText(step, each.signal.width()));
    json.push_back({{"name", each.signal.name}, {"width", each.signal.width()}, {"steps", steps}});
  }
  std::printf("%s\n", json.dump(2).c_str());
}

}  // namespace qor::tool
