#include <chrono>
#include <cstdio>
#include <iostream>
#include <iterator>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "board/record/Player.h"
#include "os/Stop.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Printable.h"

namespace qor::tool {
namespace {

using std::chrono::nanoseconds;

struct PlayOptions {
  std::string file;
  double rate = 0;
};

Report reportOf(const Played& played, bool isTimed) {
  std::string text = counted(played.rows, "row") + " in " + counted(played.exchanges, "exchange");
  if (isTimed) text += ", " + std::to_string(played.late) + " late";
  return {text + "\n", {{"rows", played.rows}, {"exchanges", played.exchanges}, {"late", played.late}}};
}

PlayScript scriptOf(const std::string& file, const SignalTable& signals) {
  if (file != "-") return readPlayScript(file, signals);
  return parsePlayScript(std::string{std::istreambuf_iterator<char>(std::cin), {}}, "stdin", signals);
}

void play(Context& context, const PlayOptions& options) {
  const nanoseconds period = options.rate == 0 ? nanoseconds(0) : periodOf(options.rate, 0.001, 1e9);
  const PlayScript script = scriptOf(options.file, context.signals());
  if (script.hasTimes() && options.rate != 0)
    throw WrongUse("the rows have times of their own and take no --rate: " + options.file);
  const Context::Stoppable stop(context);
  const Played played = qor::play(context.board(), script, period, [&stop] { return stop.asked(); });
  context.board().rememberOutputs();
  if (context.settings.json || !context.settings.quiet)
    print(reportOf(played, script.hasTimes() || options.rate != 0), context.settings.json);
}

}  // namespace

void addPlay(CLI::App& app, Context& context) {
  auto options = std::make_shared<PlayOptions>();
  CLI::App* command = app.add_subcommand("play", "drives outputs from a table of values");
  command
      ->add_option("FILE", options->file,
                   "CSV: names of outputs, and below them a row of values each; - is standard input")
      ->required();
  command->add_option("--rate", options->rate, "rows per second; without it as fast as the cable allows");
  command->footer(
      "A first column time_s says when each row is to be sent, in seconds from the start, as record writes "
      "it (a\n"
      "column missed after it is passed over). Rows that the cable was too slow for are sent late, and "
      "counted.\n"
      "Without times and rate, synchronous outputs alone play 16 rows per exchange, a row per clock of the "
      "design.\n"
      "Ctrl-C ends it between two rows.\n\n"
      "Example:\n  qorvio play steps.csv --rate 10");
  command->callback([&context, options] { play(context, *options); });
}

}  // namespace qor::tool
