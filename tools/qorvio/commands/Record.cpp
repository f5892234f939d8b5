#include <unistd.h>
#include <chrono>
#include <cstdio>
#include <thread>

#include "Commands.h"
#include "Duration.h"
#include "Errors.h"
#include "Recorder.h"
#include "Stop.h"

namespace tool {
namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::nanoseconds;

struct RecordOptions {
  std::vector<std::string> names;
  std::uint64_t samples = 0;
  std::string time;
  std::string out;
  double rate = 0;
};

struct Limits {
  std::uint64_t samples = 0;  // 0: as many as the time allows
  nanoseconds time{0};        // 0: as long as the samples take
  nanoseconds period{0};      // 0: at the full rate
};

Limits limitsOf(const RecordOptions& options) {
  if ((options.samples != 0) == !options.time.empty())
    throw WrongUse("one of --samples and --for says how much to record: record " + options.out);
  if (options.rate < 0 || options.rate > 1e9)
    throw WrongUse("not a rate in hertz: " + std::to_string(options.rate));
  Limits limits;
  limits.samples = options.samples;
  if (!options.time.empty()) limits.time = parseDuration(options.time);
  if (options.rate != 0) limits.period = nanoseconds(static_cast<std::int64_t>(1e9 / options.rate));
  return limits;
}

// One line on the terminal, drawn again four times a second.
class Progress {
 public:
  Progress(bool wanted, Limits limits) : wanted_(wanted && isatty(STDERR_FILENO) != 0), limits_(limits) {}
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

struct Result {
  std::uint64_t samples = 0;
  std::uint64_t missed = 0;
};

// Polls in step with the period; one that comes later than the next is due leaves the polls between them missed.
void runPolls(Recorder& recorder, const Limits& limits, bool showProgress, Result& result) {
  const Stop stop;
  Progress progress(showProgress, limits);
  const Clock::time_point begin = Clock::now();
  std::uint64_t due = 0;
  while (!stop.asked() && (limits.samples == 0 || result.samples < limits.samples)) {
    std::uint64_t missed = 0;
    if (limits.period.count() != 0) {
      const auto slot = static_cast<std::uint64_t>((Clock::now() - begin) / limits.period);
      if (slot > due) missed = slot - due;
      due += missed;
      std::this_thread::sleep_until(begin + static_cast<std::int64_t>(due) * limits.period);
      ++due;
    }
    if (limits.time.count() != 0 && Clock::now() - begin >= limits.time) return;
    recorder.read();
    const nanoseconds now = Clock::now() - begin;
    recorder.write(static_cast<std::uint64_t>(now.count()), missed);
    ++result.samples;
    result.missed += missed;
    progress.show(result.samples, now);
  }
}

std::string summary(const Result& result, const std::string& path) {
  return std::to_string(result.samples) + " samples in " + path +
         (result.missed != 0 ? ", " + std::to_string(result.missed) + " polls missed" : "");
}

void record(Context& context, const RecordOptions& options) {
  const Limits limits = limitsOf(options);
  CoreSession& core = context.core();
  const std::vector<Signal> signals = context.signals().select(options.names, Direction::input);
  const std::unique_ptr<SampleWriter> writer = sampleWriter(options.out);
  Recorder recorder(core, signals, *writer);
  const Settings& settings = context.settings;
  Result result;
  try {
    runPolls(recorder, limits, !settings.quiet, result);
  } catch (const Failure& failure) {  // what was recorded until then is worth keeping
    writer->end();
    throw Failure(std::string(failure.what()) + "; kept " + summary(result, options.out));
  }
  writer->end();
  if (settings.json) {
    std::printf("{\"samples\": %llu, \"missed\": %llu}\n", static_cast<unsigned long long>(result.samples),
                static_cast<unsigned long long>(result.missed));
  } else if (!settings.quiet) {
    std::printf("%s\n", summary(result, options.out).c_str());
  }
}

}  // namespace

void addRecord(CLI::App& app, Context& context) {
  auto options = std::make_shared<RecordOptions>();
  CLI::App* command = app.add_subcommand("record", "samples of inputs, to a file");
  command->add_option("NAME", options->names, "inputs; all when none is named");
  command->add_option("--samples", options->samples, "how many");
  command->add_option("--for", options->time, "how long, such as 10s");
  command->add_option("--out", options->out, "a .vcd, .csv or .jsonl file")->required();
  command->add_option("--rate", options->rate, "polls a second; the cable's full rate when it is not given");
  command->footer(
      "Polls that were missed at the rate are counted in the file. Ctrl-C ends the recording.\n\n"
      "Example:\n  qorvio --core 1.1.0 record async_in_data --for 10s --rate 100 --out counter.vcd");
  command->callback([&context, options] { record(context, *options); });
}

}  // namespace tool
