#include "tools/qorvio/Stubs.h"

#include <algorithm>
#include <cctype>
#include <map>
#include <set>

namespace qor::tool {
namespace {

// Python's own words, and what boards and frames have already.
const std::set<std::string>& takenWords() {
  static const std::set<std::string> words{
      "False",    "None",      "True",  "and",    "as",     "assert",  "async",  "await",     "break",
      "class",    "continue",  "def",   "del",    "elif",   "else",    "except", "finally",   "for",
      "from",     "global",    "if",    "import", "in",     "is",      "lambda", "nonlocal",  "not",
      "or",       "pass",      "raise", "return", "try",    "while",   "with",   "yield",     "close",
      "closed",   "condition", "cores", "edges",  "inputs", "outputs", "read",   "sample",    "url",
      "wait_for", "watch",     "write", "fell",   "keys",   "moved",   "rose",   "sync_fell", "sync_rose",
      "text",     "to_bytes",  "mro",   "name",   "value"};
  return words;
}

bool isPythonName(const std::string& text) {
  const auto isLetter = [](unsigned char letter) { return std::isalnum(letter) != 0 || letter == '_'; };
  return !text.empty() && text.front() != '_' &&
         std::isdigit(static_cast<unsigned char>(text.front())) == 0 &&
         std::all_of(text.begin(), text.end(), isLetter) && takenWords().count(text) == 0;
}

// "bus_state" as "BusState".
std::string className(const std::string& name) {
  std::string text;
  bool isStart = true;
  for (const char letter : name) {
    if (letter != '_')
      text += isStart ? static_cast<char>(std::toupper(static_cast<unsigned char>(letter))) : letter;
    isStart = letter == '_';
  }
  return text;
}

class Stubs {
 public:
  explicit Stubs(const SignalTable& signals) : bodies_{{"Board", ""}, {"Frame", ""}} {
    for (std::size_t i = 0; i < signals.fileSignals(); ++i) add(signals.signals()[i]);
  }

  std::string text() const {
    return "from typing import Any, Iterator, Mapping, Optional, Union\n\nimport qorvio\n" + enumerations_ +
           "\nclass Frame(qorvio.Frame):\n" + body(frame_) + "\nclass Board(qorvio.Board):\n" + board_ +
           "    def read(self) -> Frame: ...\n"
           "    def write(self, values: Optional[Mapping[str, Any]] = None, /" +
           (outputs_.empty() ? "" : ", *") + outputs_ +
           ", **more: Any) -> None: ...\n"
           "    def wait_for(\n"
           "        self, condition: Union[qorvio.Condition, qorvio.Signal[Any], str], timeout: "
           "Optional[float] = None\n"
           "    ) -> Frame: ...\n"
           "    def watch(\n"
           "        self, *names: str, timeout: Optional[float] = None, rate: Optional[float] = None\n"
           "    ) -> Iterator[Frame]: ...\n";
  }

 private:
  static std::string body(const std::string& lines) { return lines.empty() ? "    ...\n" : lines; }

  void add(const Signal& signal) {
    if (!isPythonName(signal.name)) return;
    const std::string type = typeOf(signal);
    if (isInput(signal.port)) frame_ += "    " + signal.name + ": " + type + "\n";
    if (!isInput(signal.port)) outputs_ += ", " + signal.name + ": Any = ...";
    if (known_.insert(signal.name).second) board_ += "    " + signal.name + ": qorvio.Signal[" + type + "]\n";
  }

  std::string typeOf(const Signal& signal) {
    if (signal.names.empty()) return signal.scale != 0 ? "qorvio.Quantity" : "int";
    std::string name = className(signal.name), text;
    for (const auto& [member, value] : signal.names)
      if (isPythonName(member)) text += "    " + member + " = " + std::to_string(value) + "\n";
    const auto other = bodies_.find(name);  // an output has often the names of its input
    if (other != bodies_.end() && other->second != text) name += isInput(signal.port) ? "In" : "Out";
    if (bodies_.emplace(name, text).second)
      enumerations_ += "\nclass " + name + "(qorvio.Enumeration):\n" + body(text);
    return name;
  }

  std::map<std::string, std::string> bodies_;  // of classes, by name
  std::set<std::string> known_;
  std::string enumerations_, frame_, board_, outputs_;
};

}  // namespace

std::string stubsOf(const SignalTable& signals) {
  return Stubs(signals).text();
}

}  // namespace qor::tool
