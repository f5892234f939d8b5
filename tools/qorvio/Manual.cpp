#include "tools/qorvio/Manual.h"

#include <sstream>

namespace qor::tool {
namespace {

// A backslash, a hyphen, and a line's first dot or quote mean something to roff.
std::string roff(const std::string& text) {
  std::string escaped;
  for (const char letter : text) {
    const bool isFirst = escaped.empty() || escaped.back() == '\n';
    if (isFirst && (letter == '.' || letter == '\'')) escaped += "\\&";
    if (letter == '\\') escaped += "\\e";
    if (letter == '-') escaped += '\\';
    if (letter != '\\') escaped += letter;
  }
  return escaped;
}

bool isShown(const CLI::Option& option) {
  return !option.get_group().empty() && !option.check_lname("help");
}

bool isFlag(const CLI::Option& option) {
  return option.get_items_expected_max() == 0;
}

bool isRepeated(const CLI::Option& option) {
  return option.get_items_expected_max() > 1;
}

// "--rate HZ" in bold and italics on one line.
std::string heading(const CLI::Option& option) {
  if (option.get_positional()) return "\\fI" + roff(option.get_name(true)) + "\\fR";
  const std::string name = "\\fB" + roff(option.get_name()) + "\\fR";
  return isFlag(option) ? name : name + " \\fI" + roff(option.get_type_name()) + "\\fR";
}

std::string entry(const CLI::Option& option) {
  const std::string standard = option.get_default_str();
  return ".TP\n" + heading(option) + "\n" + roff(option.get_description()) +
         (standard.empty() ? "" : " (default: " + roff(standard) + ")") + "\n";
}

std::string synopsis(const CLI::App& command, const std::string& name) {
  std::string text = "\\fB" + roff(name) + "\\fR";
  for (const CLI::Option* option : command.get_options()) {
    if (!isShown(*option)) continue;
    const std::string word = heading(*option) + (isRepeated(*option) ? " ..." : "");
    text += " " + (option->get_required() ? word : "[" + word + "]");
  }
  return text;
}

std::string optionsOf(const CLI::App& app) {
  std::string text;
  for (const CLI::Option* option : app.get_options())
    if (isShown(*option)) text += entry(*option);
  return text;
}

std::string commandsOf(const CLI::App& app, const std::string& before) {
  std::string text;
  for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; })) {
    const std::string name = before + command->get_name();
    text += ".SS " + synopsis(*command, name) + "\n" + roff(command->get_description()) + ".\n" +
            optionsOf(*command);
    if (!command->get_footer().empty()) text += ".PP\n.nf\n" + roff(command->get_footer()) + "\n.fi\n";
    text += commandsOf(*command, name + " ");
  }
  return text;
}

}  // namespace

std::string manualPage(const CLI::App& app, const std::string& page) {
  std::istringstream lines(page);
  std::string text;
  for (std::string line; std::getline(lines, line);) {
    if (line == "@OPTIONS@") {
      text += optionsOf(app);
    } else if (line == "@COMMANDS@") {
      text += commandsOf(app, "");
    } else {
      text += line + "\n";
    }
  }
  return text;
}

}  // namespace qor::tool
