// Value texts and map keys. Input: lines KEY=TEXT; an empty line ends the map of one write.
#include <map>

#include "QorVIO.h"
#include "tests/fuzz/OutputModel.h"
#include "tests/unit/fakes/FakePlatform.h"

namespace {

using TextMap = QorRT::hash_map<std::string, std::string>;

constexpr QOR_CORE_REF ref{0, 1, 0};
constexpr unsigned asyncWidth = 21, syncWidth = 10;

const std::map<std::string, Group> names = {
    {"async_out_data",
     {false, false, {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16, 17, 18, 19, 20}}},
    {"sync_out_data", {false, true, {0, 1, 2, 3, 4, 5, 6, 7, 8, 9}}},
    {"a", {false, false, {20}}},
    {"bus", {false, false, {11, 3, 7, 7, 0, 20, 1, 2, 5}}},
    {"s", {false, true, {9}}},
    {"t", {false, true, {8, 0, 3, 3}}},
};

void define() {
  for (const auto& [name, group] : names)
    QorVIO_defineBus(7, ref, name.c_str(), group.isSync ? 0 : 2, group.bits.data(),
                     static_cast<unsigned>(group.bits.size()));
}

/// Bit b of a text that is a number in two's complement.
bool numberBit(const std::string& text, std::size_t b) {
  if (b / 4 >= text.size()) return digitValue(text.front()) >= 8;
  return (digitValue(text[text.size() - 1 - b / 4]) >> b % 4 & 1) != 0;
}

/// What is wrong with a text for a field of so many digits; nothing for a good one.
std::string fault(const std::string& text, std::size_t digits) {
  if (!text.empty() && text.size() < digits && digitValue(text[0]) < 0)
    return "Invalid Hex String: " + text.substr(0, 1);
  bool good = !text.empty();
  for (std::size_t i = 0; i < text.size(); ++i)
    if (text.size() - i <= digits && digitValue(text[i]) < 0) good = false;
  return good ? "" : "Invalid Hex String: " + text;
}

const Group* find(std::string name) {
  for (char& c : name)
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  const auto entry = names.find(name);
  return entry == names.end() ? nullptr : &entry->second;
}

/// Stages the map, and returns what is wrong with it.
std::string write(const TextMap& map, OutputModel& model) {
  for (const auto& [key, text] : map) {
    const std::string name = key.substr(0, key.find('.'));
    const Group* group = find(name);
    if (group == nullptr) return "Could not find a signal with the name: " + name;
    if (key == name + ".pulsetrain" && !group->isSync)
      return ".pulsetrain cannot be used with the non-synchronous output: " + name;
  }
  model.clearMasks();
  for (const auto& [key, text] : map) {
    const Group& group = *find(key.substr(0, key.find('.')));
    const bool isTrain = key.find('.') != key.npos && key.substr(key.find('.')) == ".pulsetrain";
    std::string wrong = fault(text, 2 * group.bytes() * (isTrain ? 32 : 1));
    if (!wrong.empty()) return wrong;
    const std::size_t stepBits = isTrain ? 8 * group.bytes() : 0;
    model.stage(group, [&, &value = text](std::size_t s, std::size_t i) {
      return numberBit(value, s * stepBits + i);
    });
  }
  return "";
}

/// The writes and messages of a call.
std::string told() {
  std::string text;
  for (const std::string& call : fake::platform().take())
    if (call.rfind("sequence ", 0) == 0 || call.rfind("message ", 0) == 0) text += call + "\n";
  return text;
}

void check(TextMap& map, OutputModel& model) {
  TextMap* pointer = &map;
  const bool failed = QorVIO_writeValues(7, ref, &pointer) != 0;
  const std::string wrong = write(map, model);
  require(failed == !wrong.empty(), "fails: " + wrong);
  const std::string message = "message 100 " + wrong.substr(0, wrong.find('\0')) + "\n";  // as a C string
  requireEqual(told(), failed ? message : model.command());
  map.clear();
}

}  // namespace

void fuzz(std::string_view input) {
  fake::reset();
  fake::platform().answerAsVioCore(3, 2, asyncWidth, syncWidth);
  require(QorVIO_initCore(7, ref) == 0, "a core");
  define();
  told();
  OutputModel model(asyncWidth, syncWidth);
  TextMap map;
  for (const std::string& line : split(input, '\n')) {
    if (line.empty()) {
      check(map, model);
    } else {
      const std::size_t end = line.find('=');
      map[line.substr(0, end)] = end == line.npos ? "" : line.substr(end + 1);
    }
  }
  check(map, model);
}
