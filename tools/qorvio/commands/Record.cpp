#include <chrono>
#include <cstdio>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "board/record/Recording.h"
#include "os/StandardStreams.h"
#include "tools/qorvio/Number.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Printable.h"

namespace qor::tool {
namespace {

using std::chrono::nanoseconds;

struct RecordOptions {
  std::vector<std::string> names;
  std::uint64_t samples = 0;
  std::string time;
  std::string out;
  double rate = 0;
};

Limits limitsOf(const RecordOptions& options) {
  if ((options.samples != 0) == !options.time.empty())
    throw WrongUse("one of --samples and --for says how much to record: record " + options.out);
  Limits limits;
  limits.samples = options.samples;
  if (!options.time.empty()) limits.time = parseDuration(options.time);
  if (limits.samples == 0 && limits.time.count() == 0)  // which would be no limit
    throw WrongUse("too short a time to record: --for " + options.time);
  if (options.rate != 0) limits.period = periodOf(options.rate, 0.001, 1e9);
  return limits;
}

// One line on the terminal, drawn again four times a second.
class Progress {
 public:
  Progress(bool wanted, Limits limits)
      : wanted_(wanted && os::isTerminal(os::Stream::error)), limits_(limits) {}
  Progress(const Progress&) = delete;
  Progress& operator=(const Progress&) = delete;
  ~Progress() {
    if (drawn_.count() != 0) std::fputs("\r\033[K", stderr);
  }

  void show(std::uint64_t samples, nanoseconds now) {
    if (!wanted_ || now - drawn_ < std::chrono::milliseconds(250)) return;
    drawn_ = now;
    const double seconds = std::chrono::duration<double>(now).count();
    const double part = limits_.samples != 0
                            ? static_cast<double>(samples) / static_cast<double>(limits_.samples)
                            : seconds / std::chrono::duration<double>(limits_.time).count();
    const int cells = static_cast<int>(30 * part);
    std::fprintf(stderr, "\r[%.*s%*s] %llu samples, %.0f a second, %.0f s left\033[K", cells,
                 "##############################", 30 - cells, "", static_cast<unsigned long long>(samples),
                 static_cast<double>(samples) / seconds, seconds / part - seconds);
  }

 private:
  bool wanted_;
  Limits limits_;
  nanoseconds drawn_{0};
};

Recorded recordWithProgress(Context& context, const std::vector<Signal>& signals, const std::string& path,
                            const Limits& limits, bool wanted) {
  Progress progress(wanted, limits);
  const Context::Stoppable stop(context);
  return recordTo(
      path, context.board().poller(), signals, limits, [&stop] { return stop.asked(); },
      [&](const Recorded& soFar, nanoseconds now) { progress.show(soFar.samples, now); });
}

void record(Context& context, const RecordOptions& options) {
  const Limits limits = limitsOf(options);
  const std::vector<Signal> signals = context.signals().select(options.names, Direction::input);
  if (signals.empty()) throw WrongUse("no inputs to record");
  const Settings& settings = context.settings;
  const Recorded recorded = recordWithProgress(context, signals, options.out, limits, !settings.quiet);
  const std::string text = settings.quiet ? "" : printable(summary(recorded, options.out)) + "\n";
  print({text, {{"samples", recorded.samples}, {"missed", recorded.missed}}}, settings.json);
}

}  // namespace

void addRecord(CLI::App& app, Context& context) {
  auto options = std::make_shared<RecordOptions>();
  CLI::App* command = app.add_subcommand("record", "samples of inputs, to a file");
  command->add_option("INPUT", options->names, "inputs; without a name all of them");
  command->add_option("--samples", options->samples, "how many")->check(wholeNumber(1, 1'000'000'000'000));
  command->add_option("--for", options->time, "how long, such as 10s");
  command->add_option("--out", options->out, "a .vcd, .csv or .jsonl file")->required()->type_name("FILE");
  command->add_option("--rate", options->rate, "polls per second; without it as many as the cable allows");
  command->footer(
      "Polls that were missed at the rate are counted in the file. Ctrl-C ends the recording.\n\n"
      "Example:\n  qorvio --core 1.1.0 record async_in_data --for 10s --rate 100 --out counter.vcd");
  command->callback([&context, options] { record(context, *options); });
}

}  // namespace qor::tool
