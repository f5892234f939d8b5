#include <algorithm>
#include <chrono>
#include <cstdio>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "board/record/Recording.h"
#include "board/record/WaveView.h"
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
  std::string when, until;
  std::uint64_t before = 0, after = 0;
  bool withView = false;
};

Limits limitsOf(const RecordOptions& options) {
  if (options.samples == 0 && options.time.empty() && options.after == 0 && options.until.empty())
    throw WrongUse("one of --samples, --for, --after and --until says how much to record: record " +
                   options.out);
  if (options.when.empty() && (options.before != 0 || options.after != 0))
    throw WrongUse("--before and --after count from --when, which is not given: record " + options.out);
  Limits limits;
  limits.samples = options.samples;
  limits.before = options.before;
  limits.after = options.after;
  if (!options.time.empty()) limits.time = parseDuration(options.time);
  if (!options.time.empty() && limits.time.count() == 0)  // which would be no limit
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
    std::fprintf(stderr, "\r%s%llu samples, %.0f s\033[K", bar(samples, seconds).c_str(),
                 static_cast<unsigned long long>(samples), seconds);
  }

  // Of limits that are known, the one that is nearer.
  std::string bar(std::uint64_t samples, double seconds) const {
    if (limits_.samples == 0 && limits_.time.count() == 0) return "";
    double part = 0;
    if (limits_.samples != 0) part = static_cast<double>(samples) / static_cast<double>(limits_.samples);
    if (limits_.time.count() != 0)
      part = std::max(part, seconds / std::chrono::duration<double>(limits_.time).count());
    const auto cells = static_cast<std::size_t>(30 * std::min(part, 1.0));
    return "[" + std::string(cells, '#') + std::string(30 - cells, ' ') + "] ";
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
  Limits limits = limitsOf(options);
  if (!options.when.empty()) limits.when = context.board().condition(options.when);
  if (!options.until.empty()) limits.until = context.board().condition(options.until);
  const std::vector<Signal> signals = context.signals().select(options.names, Direction::input);
  if (signals.empty()) throw WrongUse("no inputs to record");
  if (options.withView) writeWaveView(options.out, signals, context.board().poller().cores());
  const Settings& settings = context.settings;
  const Recorded recorded = recordWithProgress(context, signals, options.out, limits, !settings.quiet);
  context.board().markSeen(signals);
  if (options.out[0] == '-') return;  // which has the output
  const std::string never = recorded.isTriggered ? "" : "; never true: " + options.when;
  const std::string text = settings.quiet ? "" : printable(summary(recorded, options.out) + never) + "\n";
  nlohmann::ordered_json json{{"samples", recorded.samples}, {"missed", recorded.missed}};
  if (limits.when) json["triggered"] = recorded.isTriggered;
  print({text, json}, settings.json);
}

}  // namespace

void addRecord(CLI::App& app, Context& context) {
  auto options = std::make_shared<RecordOptions>();
  CLI::App* command = app.add_subcommand("record", "samples of inputs, to a file");
  command->add_option("INPUT", options->names, "inputs; without a name all of them");
  command->add_option("--samples", options->samples, "how many")->check(wholeNumber(1, 1'000'000'000'000));
  command->add_option("--for", options->time, "how long, such as 10s, with the wait for --when");
  command
      ->add_option("--out", options->out,
                   "a .vcd, .csv or .jsonl file; - is standard output as CSV, -.vcd and -.jsonl too")
      ->required()
      ->type_name("FILE");
  command->add_option("--rate", options->rate, "polls per second; without it as many as the cable allows");
  command->add_option("--when", options->when, "samples are kept from the one on that makes this true")
      ->type_name("CONDITION");
  command->add_option("--before", options->before, "samples kept before that one")
      ->check(wholeNumber(0, 1'000'000));
  command->add_option("--after", options->after, "samples after it, which end the recording")
      ->check(wholeNumber(1, 1'000'000'000'000));
  command->add_option("--until", options->until, "ends with the sample that makes this true")
      ->type_name("CONDITION");
  command->add_flag("--gtkwave", options->withView,
                    "beside a .vcd file also a .gtkw file and translate files, for names and scales");
  command->footer(
      "Polls that were missed at the rate are counted in the file. Conditions are written as for wait. "
      "Ctrl-C "
      "ends the\n"
      "recording.\n\n"
      "Example:\n  qorvio --core 1.1.0 record async_in_data --for 10s --rate 100 --out counter.vcd\n"
      "  qorvio record --when 'async_in_data[0] rises' --before 100 --after 1000 --out fault.csv");
  command->callback([&context, options] { record(context, *options); });
}

}  // namespace qor::tool
