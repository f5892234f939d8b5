// pulse, toggle, press: one bit of an output.
#include <chrono>
#include <optional>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "tools/qorvio/Assignments.h"
#include "tools/qorvio/Number.h"
#include "tools/qorvio/commands/Commands.h"

namespace qor::tool {
namespace {

struct PulseOptions {
  std::string name;
  unsigned width = 1;
  unsigned at = 0;
};

struct PressOptions {
  std::string name;
  std::string time = "100ms";
};

void write(Context& context, const Assignment& assignment) {
  context.board().give({assignment});
  context.board().rememberOutputs();
  printWritten(context, {assignment});
}

void press(Context& context, const PressOptions& options) {
  const std::chrono::nanoseconds time = parseDuration(options.time);
  const Signal signal = context.signals().find(options.name, Direction::output);
  requireBit(signal);
  const Context::Stoppable stop(context);  // whoever interrupts it finds the output released
  context.board().give({level(signal, {1})});
  context.board().rememberOutputs();
  stop.sleepUntil(std::chrono::steady_clock::now() + time);
  write(context, level(signal, {0}));
}

void addPulse(CLI::App& app, Context& context) {
  auto options = std::make_shared<PulseOptions>();
  CLI::App* command =
      app.add_subcommand("pulse", "one bit of a synchronous output high for a clock of the design");
  command->add_option("OUTPUT", options->name, "the output bit")->required();
  command->add_option("--width", options->width, "clocks that it is high: 1 to 15")
      ->capture_default_str()
      ->check(wholeNumber(1, 15));
  command->add_option("--at", options->at, "the step at which it rises: 0 to 14")
      ->capture_default_str()
      ->check(wholeNumber(0, 14));
  command->footer("Example:\n  qorvio pulse sync_out_data[5] --width 3");
  command->callback([&context, options] {
    const Signal signal = context.signals().find(options->name, Direction::output);
    write(context, pulseOf(signal, {options->width, options->at}));
  });
}

void addToggle(CLI::App& app, Context& context) {
  struct Options {
    std::string name;
    std::optional<bool> assumed;
  };
  auto options = std::make_shared<Options>();
  CLI::App* command =
      app.add_subcommand("toggle", "one output bit to the opposite of what it was given last");
  command->add_option("OUTPUT", options->name, "the output bit")->required();
  command->add_option("--assume", options->assumed,
                      "what it was given last, where that is not known: 0 or 1");
  command->footer(
      "Outputs cannot be read back: what they were given is remembered from run to run.\n\n"
      "Example:\n  qorvio toggle async_out_data[0]");
  command->callback([&context, options] {
    const Signal signal = context.signals().find(options->name, Direction::output);
    const Core& core = context.board().core(signal.core);
    requireBit(signal);
    if (!core.lastGiven(signal) && !options->assumed)
      throw WrongUse("it is not known what this output was last given, say it by --assume 0 or 1: " +
                     signal.name);
    const Assignment assignment = toggled(core, signal, options->assumed);
    write(context, assignment);
    if (!context.settings.json && !context.settings.quiet)
      std::printf("%s = %u\n", signal.name.c_str(), static_cast<unsigned>(assignment.steps[0][0]));
  });
}

void addPress(CLI::App& app, Context& context) {
  auto options = std::make_shared<PressOptions>();
  CLI::App* command =
      app.add_subcommand("press", "one output bit to 1, and after a while to 0, like a button");
  command->add_option("OUTPUT", options->name, "the output bit")->required();
  command->add_option("--for", options->time, "how long, such as 100ms or 2s")->capture_default_str();
  command->footer(
      "Ctrl-C releases it before its time, and ends with 130.\n\nExample:\n  qorvio press async_out_data[0] "
      "--for 1s");
  command->callback([&context, options] { press(context, *options); });
}

}  // namespace

void addBitCommands(CLI::App& app, Context& context) {
  addPulse(app, context);
  addToggle(app, context);
  addPress(app, context);
}

}  // namespace qor::tool
