// Commands from a file, in one session on one cable.
#include <chrono>
#include <cstdio>
#include <fstream>
#include <iostream>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "platform/jtag/cable/Qor_Spelling.h"
#include "tools/qorvio/CommandLine.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Printable.h"

namespace qor::tool {
namespace {

constexpr const char* standardInput = "stdin";

struct RunOptions {
  std::string file;
  bool asTap = false;
};

struct Step {
  std::size_t line;
  std::string text;
  std::vector<std::string> words;
};

// Words as a shell takes them: blanks between, '...' and "..." around what has blanks, nothing expanded.
std::vector<std::string> wordsOf(const std::string& text) {
  std::vector<std::string> words;
  bool isInside = false;
  char quote = 0;
  for (const char letter : text) {
    if (quote == 0 && letter == '#' && !isInside) break;
    if (quote == 0 && (letter == ' ' || letter == '\t' || letter == '\r')) {
      isInside = false;
      continue;
    }
    if (!isInside) words.emplace_back();
    isInside = true;
    if (letter == quote) {
      quote = 0;
    } else if (quote == 0 && (letter == '\'' || letter == '"')) {
      quote = letter;
    } else {
      words.back() += letter;
    }
  }
  if (quote != 0) throw WrongUse(std::string("a quote that does not end: ") + quote);
  return words;
}

std::vector<Step> stepsIn(std::istream& script, const std::string& name) {
  std::vector<Step> steps;
  std::size_t line = 0;
  for (std::string text; std::getline(script, text);) {
    ++line;
    try {
      std::vector<std::string> words = wordsOf(text);
      if (!words.empty()) steps.push_back({line, text, std::move(words)});
    } catch (const WrongUse& error) {
      throw WrongUse(name + ":" + std::to_string(line) + ": " + error.what());
    }
  }
  if (script.bad()) throw WrongUse("cannot read the file: " + name);
  return steps;
}

std::vector<Step> readScript(const std::string& file) {
  if (file == standardInput) return stepsIn(std::cin, file);
  std::ifstream script(file);
  if (!script) throw WrongUse("cannot read the file: " + file);
  return stepsIn(script, file);
}

void sleep(Context& context, const std::string& time) {
  const Context::Stoppable stop(context);
  stop.sleepUntil(std::chrono::steady_clock::now() + parseDuration(time));
  if (stop.asked()) throw Stopped("interrupted");
}

void addForScripts(CLI::App& app, Context& context) {
  auto time = std::make_shared<std::string>();
  CLI::App* pause = app.add_subcommand("sleep", "waits so long");
  pause->add_option("TIME", *time, "such as 100ms or 2s")->required();
  pause->callback([&context, time] { sleep(context, *time); });
  auto words = std::make_shared<std::vector<std::string>>();
  CLI::App* echo = app.add_subcommand("echo", "prints the words");
  echo->add_option("WORD", *words, "text");
  echo->callback([words] {
    for (const std::string& each : *words)
      std::printf("%s%s", &each == words->data() ? "" : " ", printable(each).c_str());
    std::printf("\n");
  });
}

void obey(Context& context, const Step& step) {
  CLI::App app;
  app.name("");
  app.require_subcommand(1);
  addScriptCommands(app, context);
  addForScripts(app, context);
  try {
    app.parse(std::vector<std::string>(step.words.rbegin(), step.words.rend()));
  } catch (const CLI::ParseError& error) {
    if (!app.get_subcommands().empty()) throw WrongUse(error.what());
    std::vector<std::string> names;
    for (const CLI::App* each : app.get_subcommands([](const CLI::App*) { return true; }))
      names.push_back(each->get_name());
    throw WrongUse("no such command in a script" +
                   QorRT::didYouMean(step.words.front(), {names.begin(), names.end()}) + ": " +
                   step.words.front());
  }
}

// The same kind of error, with the place before it.
void obeyAt(Context& context, const Step& step, const std::string& file) {
  const std::string place = file + ":" + std::to_string(step.line) + ": ";
  try {
    obey(context, step);
  } catch (const WrongUse& error) {
    throw WrongUse(place + error.what());
  } catch (const std::exception& error) {
    throw Failure(place + error.what());
  }
}

void run(Context& context, const RunOptions& options) {
  const std::string file = options.file == "-" ? standardInput : options.file;
  const std::vector<Step> steps = readScript(file);
  if (options.asTap) std::printf("1..%zu\n", steps.size());
  for (std::size_t i = 0; i < steps.size(); ++i) {
    const std::string what = std::to_string(i + 1) + " - " + printable(steps[i].text) + "\n";
    try {
      obeyAt(context, steps[i], file);
    } catch (const std::exception& error) {
      if (options.asTap)
        std::printf("not ok %sBail out! %s\n", what.c_str(), printable(error.what()).c_str());
      throw;
    }
    if (options.asTap) std::printf("ok %s", what.c_str());
    std::fflush(stdout);
    if (context.exitStatus() != 0) return;  // a signal ended the command before its time
  }
}

}  // namespace

void addRun(CLI::App& app, Context& context) {
  auto options = std::make_shared<RunOptions>();
  CLI::App* command = app.add_subcommand("run", "commands from a file, in one session on one cable");
  command->add_option("FILE", options->file, "commands, one per line; - is standard input")->required();
  command->add_flag("--tap", options->asTap, "results as Test Anything Protocol");
  command->footer(
      "Lines are commands as after qorvio, without its own options: read, write, wait, expect, ...; also "
      "sleep TIME and\n"
      "echo WORD.... Quotes work as in a shell, # begins a comment. The first failure ends it, with its "
      "line.\n\n"
      "Example:\n  qorvio run selftest.qv --tap");
  command->callback([&context, options] { run(context, *options); });
}

}  // namespace qor::tool
