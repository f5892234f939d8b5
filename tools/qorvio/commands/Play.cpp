#include <chrono>
#include <cstdio>
#include <fstream>
#include <thread>

#include "Commands.h"
#include "Errors.h"
#include "Stop.h"

namespace tool {
namespace {

constexpr std::size_t stepCount = 16;

struct PlayOptions {
  std::string file;
  double rate = 0;
};

struct Script {
  std::vector<Signal> signals;           // one a column
  std::vector<std::vector<Bytes>> rows;  // one value a column
};

// Fields of a line; one may stand in double quotes, with two of them for one.
std::vector<std::string> fieldsOf(const std::string& line) {
  std::vector<std::string> fields(1);
  bool quoted = false;
  for (std::size_t i = 0; i < line.size(); ++i) {
    const bool isQuote = line[i] == '"';
    if (isQuote && quoted && i + 1 < line.size() && line[i + 1] == '"') {
      fields.back() += line[++i];
    } else if (isQuote) {
      quoted = !quoted;
    } else if (line[i] == ',' && !quoted) {
      fields.emplace_back();
    } else if (line[i] != '\r') {
      fields.back() += line[i];
    }
  }
  return fields;
}

[[noreturn]] void failAt(const std::string& file, std::size_t line, const std::string& problem) {
  throw WrongUse(file + ":" + std::to_string(line) + ": " + problem);
}

template <class Action>
auto at(const std::string& file, std::size_t line, Action action) {
  try {
    return action();
  } catch (const WrongUse& error) {
    failAt(file, line, error.what());
  }
}

std::vector<Bytes> rowOf(const Script& script, const std::vector<std::string>& fields) {
  if (fields.size() != script.signals.size())
    throw WrongUse(std::to_string(fields.size()) + " values for " + std::to_string(script.signals.size()) +
                   " outputs");
  std::vector<Bytes> row;
  row.reserve(fields.size());
  for (std::size_t i = 0; i < fields.size(); ++i) row.push_back(parseValue(script.signals[i], fields[i]));
  return row;
}

Script readScript(const std::string& path, const SignalTable& signals) {
  std::ifstream file(path);
  if (!file) throw WrongUse("cannot read the file: " + path);
  Script script;
  std::string line;
  for (std::size_t number = 1; std::getline(file, line); ++number) {
    const std::vector<std::string> fields = fieldsOf(line);
    if (number == 1) {
      script.signals = at(path, number, [&] { return signals.select(fields, Direction::output); });
    } else {
      script.rows.push_back(at(path, number, [&] { return rowOf(script, fields); }));
    }
  }
  if (script.rows.empty()) failAt(path, 1, "has no row of values below its names");
  return script;
}

bool canBurst(const Script& script) {
  for (const Signal& each : script.signals)
    if (each.port != Port::syncOut) return false;
  return true;
}

// The rows from `first` on, as many as one exchange takes: with several, the last one stays.
std::vector<Assignment> assignmentsOf(const Script& script, std::size_t first, std::size_t count) {
  std::vector<Assignment> assignments;
  for (std::size_t column = 0; column < script.signals.size(); ++column) {
    Assignment each{script.signals[column], {}};
    for (std::size_t row = first; row < first + count; ++row) each.steps.push_back(script.rows[row][column]);
    if (count > 1) each.steps.resize(stepCount, Bytes(each.steps.back()));
    assignments.push_back(std::move(each));
  }
  return assignments;
}

void play(Context& context, const PlayOptions& options) {
  if (options.rate < 0 || options.rate > 1e9)
    throw WrongUse("not a rate in hertz: " + std::to_string(options.rate));
  const Script script = readScript(options.file, context.signals());
  const std::size_t atOnce = options.rate == 0 && canBurst(script) ? stepCount : 1;
  const std::chrono::nanoseconds period(options.rate == 0 ? 0
                                                          : static_cast<std::int64_t>(1e9 / options.rate));
  const Stop stop;
  auto due = std::chrono::steady_clock::now();
  std::size_t row = 0;
  for (; row < script.rows.size() && !stop.asked(); due += period) {
    std::this_thread::sleep_until(due);
    const std::size_t count = std::min(atOnce, script.rows.size() - row);
    context.core().write(assignmentsOf(script, row, count));
    row += count;
  }
  const std::size_t exchanges = (row + atOnce - 1) / atOnce;
  if (context.settings.json) {
    std::printf("{\"rows\": %zu, \"exchanges\": %zu}\n", row, exchanges);
  } else if (!context.settings.quiet) {
    std::printf("%zu rows in %zu exchanges\n", row, exchanges);
  }
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
      "Without a rate, synchronous outputs alone play 16 rows an exchange, a row a clock of the design.\n\n"
      "Example:\n  qorvio play steps.csv --rate 10");
  command->callback([&context, options] { play(context, *options); });
}

}  // namespace tool
