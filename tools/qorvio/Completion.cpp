#include "tools/qorvio/Completion.h"

#include <algorithm>
#include <cctype>
#include <string_view>
#include <utility>

#include "board/model/SignalFile.h"
#include "board/model/SignalTable.h"

namespace qor::tool {
namespace {

using Words = std::vector<std::string>;

constexpr const char* wordBreaks = ":=";

// "a", "=", "5" is one word.
Words joined(const Words& pieces) {
  Words words;
  bool goesOn = false;
  for (const std::string& piece : pieces) {
    const bool isBreak = !piece.empty() && piece.find_first_not_of(wordBreaks) == piece.npos;
    if (!words.empty() && (isBreak || goesOn)) {
      words.back() += piece;
    } else {
      words.push_back(piece);
    }
    goesOn = isBreak;
  }
  return words;
}

bool isPlain(const std::string& text) {
  return std::all_of(text.begin(), text.end(), [](unsigned char letter) {
    return letter >= 0x80 || std::isalnum(letter) != 0 ||
           std::string_view("_-./:=[]").find(static_cast<char>(letter)) != std::string_view::npos;
  });
}

Words split(const std::string& text, char separator) {
  Words parts(1);
  for (const char letter : text) {
    if (letter == separator) {
      parts.emplace_back();
    } else {
      parts.back() += letter;
    }
  }
  return parts;
}

bool takesValue(const CLI::Option& option) {
  return option.get_items_expected_max() > 0;
}

// Within a cable URL.
bool isInFileName(const std::string& word) {
  return word.rfind("sim:", 0) == 0 || word.find("config=") != word.npos || word.find("board=") != word.npos;
}

// Where a command line has come to.
class Place {
 public:
  Place(const CLI::App& app, Settings settings)
      : root_(app), command_(&app), settings_(std::move(settings)) {}

  void pass(const std::string& word) {
    if (const CLI::Option* option = std::exchange(awaited_, nullptr)) return take(*option, word);
    const std::size_t equals = word.find('=');
    if (const CLI::Option* option = optionNamed(word.substr(0, equals))) {
      if (!takesValue(*option)) return;
      return equals == word.npos ? void(awaited_ = option) : take(*option, word.substr(equals + 1));
    }
    if (const CLI::App* command = commandNamed(word)) {
      command_ = command;
    } else {
      ++arguments_;
    }
  }

  Words candidates(const std::string& word) {
    if (awaited_ != nullptr) return valuesOf(awaited_->get_type_name(), word);
    if (!word.empty() && word[0] == '-') return options();
    Words words;
    for (const CLI::App* each : commandsOf(*command_)) words.push_back(each->get_name());
    if (!words.empty()) return words;
    const CLI::Option* argument = currentArgument();
    if (argument == nullptr) return {};
    const std::string type = argument->get_type_name();
    return valuesOf(type.find('|') != type.npos ? type : argument->get_name(true), word);
  }

 private:
  static std::vector<const CLI::App*> commandsOf(const CLI::App& app) {
    return app.get_subcommands([](const CLI::App*) { return true; });
  }

  const CLI::App* commandNamed(const std::string& word) const {
    for (const CLI::App* each : commandsOf(*command_))
      if (each->get_name() == word) return each;
    return nullptr;
  }

  const CLI::Option* optionNamed(const std::string& word) const {
    if (word.rfind("--", 0) != 0) return nullptr;
    const CLI::Option* option = command_->get_option_no_throw(word);
    return option != nullptr ? option : root_.get_option_no_throw(word);
  }

  void take(const CLI::Option& option, const std::string& value) {
    if (option.check_lname("signals")) settings_.signals = value;
    if (option.check_lname("cable")) settings_.cable = value;
    if (option.check_lname("core")) settings_.core = value;
  }

  Words options() const {
    Words words;
    for (const CLI::App* app : {command_, &root_})
      for (const CLI::Option* option : app->get_options())
        for (const std::string& name : option->get_lnames()) words.push_back("--" + name);
    return words;
  }

  const CLI::Option* currentArgument() const {
    const CLI::Option* last = nullptr;
    int before = 0;
    for (const CLI::Option* option : command_->get_options()) {
      if (!option->get_positional()) continue;
      last = option;
      before += std::min(option->get_items_expected_max(), 1000);
      if (arguments_ < before) return option;
    }
    return arguments_ < before ? last : nullptr;
  }

  // `kind` is as the help text names the value.
  Words valuesOf(const std::string& kind, const std::string& word) {
    if (kind.find('|') != kind.npos) return split(kind, '|');
    if (kind == "URL") return isInFileName(word) ? Words{fileNames} : Words{"sim:", "rbb:", "openocd:"};
    if (kind == "INPUT" || kind == "CONDITION") return names(Direction::input, "");
    if (kind == "OUTPUT") return names(Direction::output, "");
    if (kind == "OUTPUT=VALUE")
      return word.find('=') == word.npos ? names(Direction::output, "=") : enumeration(word);
    if (kind.rfind("FILE", 0) == 0 || kind.rfind("BOARD", 0) == 0) return {fileNames};
    return {};
  }

  SignalTable signals() {
    settings_.complete();
    return settings_.signals.empty() ? SignalTable() : readSignalFile(settings_.signals);
  }

  Words names(Direction direction, const char* ending) {
    Words words;
    const SignalTable table = signals();
    for (const Signal& each : table.signals())
      if (isInput(each.port) == (direction == Direction::input)) words.push_back(each.name + ending);
    for (const Port port : {Port::asyncOut, Port::syncOut, Port::asyncIn, Port::syncIn})
      if (isInput(port) == (direction == Direction::input))
        words.push_back(std::string(wholePortName(port)) + ending);
    return words;
  }

  Words enumeration(const std::string& word) {
    const std::string name = word.substr(0, word.find('='));
    Words words;
    for (const auto& [text, value] : signals().find(name, Direction::output).names)
      words.emplace_back(name).append("=").append(text);
    return words;
  }

  const CLI::App& root_;
  const CLI::App* command_;
  Settings settings_;
  const CLI::Option* awaited_ = nullptr;
  int arguments_ = 0;
};

}  // namespace

std::vector<std::string> completions(const CLI::App& app, Settings settings, const Words& pieces) {
  Words words = joined(pieces);
  if (words.empty()) words.emplace_back();
  const std::string word = words.back();
  words.pop_back();
  Place place(app, std::move(settings));
  for (const std::string& each : words) place.pass(each);
  Words candidates = place.candidates(word);
  if (candidates == Words{fileNames}) return candidates;
  const std::size_t kept = word.find_last_of(wordBreaks) + 1;  // 0 without one
  Words offered;
  for (const std::string& each : candidates)
    if (each.compare(0, word.size(), word) == 0 && isPlain(each)) offered.push_back(each.substr(kept));
  return offered;
}

}  // namespace qor::tool
