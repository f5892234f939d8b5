#include <algorithm>
#include <chrono>
#include <cstdio>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "board/record/PlayScript.h"
#include "os/Stop.h"
#include "tools/qorvio/commands/Commands.h"

namespace qor::tool {
namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::nanoseconds;

struct PlayOptions {
  std::string file;
  double rate = 0;
};

struct Played {
  std::size_t rows = 0;
  std::size_t exchanges = 0;
  std::size_t late = 0;  ///< rows that were due before the row above them was done
};

// When a row is due, from the start on; 0 when it is to be sent as soon as the cable is free.
class Timing {
 public:
  Timing(const PlayScript& script, nanoseconds period) : script_(script), period_(period) {}

  bool isAsap() const { return !script_.hasTimes() && period_.count() == 0; }
  nanoseconds due(std::size_t row) const {
    return script_.hasTimes() ? script_.times[row] : static_cast<std::int64_t>(row) * period_;
  }

 private:
  const PlayScript& script_;
  nanoseconds period_;
};

bool canBurst(const PlayScript& script) {
  for (const Signal& each : script.signals)
    if (each.port != Port::syncOut) return false;
  return true;
}

// The rows from `first` on, as many as one exchange takes: with several, the last one stays.
std::vector<Assignment> rowsFrom(const PlayScript& script, std::size_t first, std::size_t count) {
  std::vector<Assignment> assignments;
  for (std::size_t column = 0; column < script.signals.size(); ++column) {
    Assignment each{script.signals[column], {}};
    for (std::size_t row = first; row < first + count; ++row) each.steps.push_back(script.rows[row][column]);
    if (count > 1) each.steps.resize(stepCount, Bytes(each.steps.back()));
    assignments.push_back(std::move(each));
  }
  return assignments;
}

Played playRows(Board& board, const PlayScript& script, const Timing& timing) {
  const std::size_t atOnce = timing.isAsap() && canBurst(script) ? stepCount : 1;
  const os::Stop stop;
  Played played;
  const Clock::time_point begin = Clock::now();
  while (played.rows < script.rows.size()) {
    const Clock::time_point due = begin + timing.due(played.rows);
    if (!timing.isAsap() && played.rows != 0 && Clock::now() > due) ++played.late;
    stop.sleepUntil(due);
    if (stop.asked()) break;
    const std::size_t count = std::min(atOnce, script.rows.size() - played.rows);
    board.give(rowsFrom(script, played.rows, count));
    played.rows += count;
    ++played.exchanges;
  }
  return played;
}

void print(const Played& played, bool isTimed, bool asJson) {
  if (asJson) {
    std::printf("{\"rows\": %zu, \"exchanges\": %zu, \"late\": %zu}\n", played.rows, played.exchanges,
                played.late);
    return;
  }
  std::printf("%zu rows in %zu exchanges", played.rows, played.exchanges);
  if (isTimed) std::printf(", %zu late", played.late);
  std::printf("\n");
}

void play(Context& context, const PlayOptions& options) {
  const nanoseconds period = options.rate == 0 ? nanoseconds(0) : periodOf(options.rate, 0.001, 1e9);
  const PlayScript script = readPlayScript(options.file, context.signals());
  if (script.hasTimes() && options.rate != 0)
    throw WrongUse("the rows have times of their own and take no --rate: " + options.file);
  const Timing timing(script, period);
  const Played played = playRows(context.board(), script, timing);
  if (context.settings.json || !context.settings.quiet)
    print(played, !timing.isAsap(), context.settings.json);
}

}  // namespace

void addPlay(CLI::App& app, Context& context) {
  auto options = std::make_shared<PlayOptions>();
  CLI::App* command = app.add_subcommand("play", "drives outputs from a table of values");
  command->add_option("FILE", options->file, "CSV: names of outputs, and below them a row of values each")
      ->required();
  command->add_option("--rate", options->rate,
                      "rows a second; as fast as the cable goes when it is not given");
  command->footer(
      "A first column time_s tells when each row is to be sent, in seconds from the start, as record writes "
      "it (a\n"
      "column missed behind it is passed over). Rows that the cable was too slow for are sent late, and "
      "counted.\n"
      "Without times and rate, synchronous outputs alone play 16 rows an exchange, a row a clock of the "
      "design.\n"
      "Ctrl-C ends it between two rows.\n\n"
      "Example:\n  qorvio play steps.csv --rate 10");
  command->callback([&context, options] { play(context, *options); });
}

}  // namespace qor::tool
