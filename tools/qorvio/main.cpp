#include <cstdio>
#include <exception>
#include <iostream>
#include <iterator>

#include "board/model/Errors.h"
#include "os/StandardStreams.h"
#include "platform/jtag/cable/Qor_Spelling.h"
#include "tools/qorvio/CommandLine.h"
#include "tools/qorvio/Completion.h"
#include "tools/qorvio/Manual.h"
#include "tools/qorvio/terminal/Printable.h"

namespace {

enum ExitStatus { done = 0, deviceFailed = 1, wrongUse = 2 };

int complain(const std::string& what, int status) {
  std::fflush(stdout);
  std::fprintf(stderr, "qorvio: %s\n", qor::tool::printable(what).c_str());
  return status;
}

// What there is at this place of the command line: options, or commands.
std::vector<std::string> namesKnown(const CLI::App& app, bool areOptions) {
  std::vector<std::string> names;
  for (const CLI::App* command : app.get_subcommands([](const CLI::App*) { return true; })) {
    if (!areOptions) names.push_back(command->get_name());
    if (areOptions && app.got_subcommand(command)) names = namesKnown(*command, true);
  }
  for (const CLI::Option* option : app.get_options())
    for (const std::string& name : option->get_lnames())
      if (areOptions) names.push_back("--" + name);
  return names;
}

std::string unexpected(const CLI::App& app, const std::string& word) {
  const bool isOption = word.rfind('-', 0) == 0;
  if (!isOption && !app.get_subcommands().empty()) return "an argument too many: " + word;
  const std::vector<std::string> names = namesKnown(app, isOption);
  return std::string("no such ") + (isOption ? "option" : "command") +
         QorRT::didYouMean(word, {names.begin(), names.end()}) + ": " + word;
}

int runCommand(CLI::App& app, const qor::tool::Context& context, int argc, char** argv) {
  try {
    app.parse(argc, argv);
    return context.exitStatus();
  } catch (const CLI::Success& asked) {  // help or version
    return app.exit(asked);
  } catch (const CLI::ParseError& error) {
    const std::vector<std::string> rest = app.remaining(true);
    return complain(rest.empty() ? error.what() : unexpected(app, rest.front()), wrongUse);
  } catch (const qor::WrongUse& error) {
    return complain(error.what(), wrongUse);
  } catch (const std::exception& error) {
    return complain(error.what(), context.exitStatus() != 0 ? context.exitStatus() : deviceFailed);
  }
}

// For bash and for the build, not for people: qorvio --complete WORD..., qorvio --man <PAGE.
bool runHidden(const CLI::App& app, const qor::tool::Settings& settings,
               const std::vector<std::string>& words) {
  if (words.empty() || (words[0] != "--complete" && words[0] != "--man")) return false;
  if (words[0] == "--man") {
    const std::string page{std::istreambuf_iterator<char>(std::cin), {}};
    std::printf("%s", qor::tool::manualPage(app, page).c_str());
  } else {
    for (const std::string& each : qor::tool::completions(app, settings, {words.begin() + 1, words.end()}))
      std::printf("%s\n", each.c_str());
  }
  return true;
}

int runTool(int argc, char** argv) {
  CLI::App app;
  qor::tool::Context context;
  qor::tool::addCommands(app, context);
  if (runHidden(app, context.settings, {argv + 1, argv + argc})) return done;
  return runCommand(app, context, argc, argv);
}

}  // namespace

int main(int argc, char** argv) {
  os::openMissingStreams();
  int status = deviceFailed;
  try {
    status = runTool(argc, argv);
  } catch (const std::exception& error) {
    status = complain(error.what(), deviceFailed);
  }
  if (std::fflush(stdout) != 0 || std::ferror(stdout) != 0)
    return complain("cannot write the output: stdout", deviceFailed);
  return status;
}
