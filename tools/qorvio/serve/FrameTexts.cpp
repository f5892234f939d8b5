#include "tools/qorvio/serve/FrameTexts.h"

#include <algorithm>

#include "board/served/Messages.h"

namespace qor::tool {
namespace {

unsigned codeOf(const Activity& activity) {
  return (activity.up ? 1U : 0U) + (activity.down ? 2U : 0U) + (activity.syncUp ? 4U : 0U) +
         (activity.syncDown ? 8U : 0U);
}

void append(std::string& text, std::size_t number, const Signal& signal, const Bytes& value, unsigned code) {
  text += text.empty() ? "[" : ",[";
  text += std::to_string(number);
  text += ",\"";
  appendHex(text, value, signal.width());
  text += "\",";
  text += std::to_string(code);
  text += ']';
}

}  // namespace

std::vector<Signal> servedSignals(const SignalTable& table) {
  const auto ofFile = table.signals().begin() + static_cast<std::ptrdiff_t>(table.fileSignals());
  const auto namesAny = [&](bool inputs) {
    return std::any_of(table.signals().begin(), ofFile,
                       [&](const Signal& each) { return isInput(each.port) == inputs; });
  };
  const bool inputs = namesAny(true), outputs = namesAny(false);
  std::vector<Signal> served(table.signals().begin(), ofFile);
  std::copy_if(ofFile, table.signals().end(), std::back_inserter(served),
               [&](const Signal& each) { return isInput(each.port) ? !inputs : !outputs; });
  return served;
}

InputTexts::InputTexts(const std::vector<Signal>& signals) {
  for (std::size_t i = 0; i < signals.size(); ++i)
    if (isInput(signals[i].port)) inputs_.push_back({i, signals[i], Bytes(byteCount(signals[i].width()))});
}

std::string InputTexts::changed(const std::vector<Sample>& samples) {
  std::string text;
  for (Input& each : inputs_) {
    const Sample& sample = samples[each.signal.core];
    const unsigned code = codeOf(activityOf(each.signal, sample));
    extract(each.signal, sample.values(each.signal.port), value_);
    if (code == 0 && value_ == each.value) continue;
    each.value = value_;
    append(text, each.number, each.signal, value_, code);
  }
  return text;
}

std::string InputTexts::all(const std::vector<Sample>& samples) const {
  std::string text;
  Bytes value;
  for (const Input& each : inputs_) {
    const Sample& sample = samples[each.signal.core];
    extract(each.signal, sample.values(each.signal.port), value);
    append(text, each.number, each.signal, value, codeOf(activityOf(each.signal, sample)));
  }
  return text;
}

OutputTexts::OutputTexts(const std::vector<Signal>& signals, const Board& board, const Claims& claims)
    : board_(board), claims_(claims) {
  for (std::size_t i = 0; i < signals.size(); ++i)
    if (!isInput(signals[i].port)) outputs_.push_back({i, signals[i], ""});
  changed();
}

std::string OutputTexts::textOf(const Output& output) const {
  Json json{output.number, nullptr, nullptr};
  if (const auto value = board_.lastGiven(output.signal)) json[1] = hexText(*value, output.signal.width());
  if (const Owner* owner = claims_.ownerOf(output.signal))
    json[2] = {{"client", owner->client}, {"name", owner->name}, {"since", owner->since}};
  return qor::textOf(json);
}

std::string OutputTexts::changed() {
  std::string text;
  for (Output& each : outputs_) {
    std::string now = textOf(each);
    if (now == each.text) continue;
    each.text = std::move(now);
    text += (text.empty() ? "" : ",") + each.text;
  }
  return text;
}

std::string OutputTexts::all() const {
  std::string text;
  for (const Output& each : outputs_) text += (text.empty() ? "" : ",") + each.text;
  return text;
}

}  // namespace qor::tool
