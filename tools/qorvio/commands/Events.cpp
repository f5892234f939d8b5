// Changes of inputs, as they come.
#include <chrono>
#include <cstdio>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "os/StandardStreams.h"
#include "os/Stop.h"
#include "tools/qorvio/InputJson.h"
#include "tools/qorvio/Number.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Arrow.h"
#include "tools/qorvio/terminal/Printable.h"

namespace qor::tool {
namespace {

using Clock = std::chrono::steady_clock;

struct EventOptions {
  std::vector<std::string> names;
  std::uint64_t count = 0;
  std::string time;
  double rate = 0;
};

std::string lineOf(const Signal& input, const Sample& sample, double seconds, bool asJson) {
  if (asJson) {
    nlohmann::ordered_json line{{"time_s", seconds}};
    line.update(jsonOf(input, sample));
    return jsonLine(line) + "\n";
  }
  Bytes value;
  extract(input, sample.values(input.port), value);
  const Activity activity = activityOf(input, sample);
  char time[40];
  std::snprintf(time, sizeof time, "%.6f", seconds);
  return std::string(time) + "  " + printable(input.name) + "  " + printable(shown(input, value)) + "  " +
         arrow(activity.up, activity.down) + "\n";
}

bool hasMoved(const Signal& input, const Sample& sample) {
  const Activity activity = activityOf(input, sample);
  return activity.up || activity.down;
}

// When polls are due, and whether any is.
struct Pace {
  Clock::time_point begin = Clock::now();
  Clock::duration period{};
  Clock::duration time{};
  Clock::time_point due = begin;

  bool await(const os::Stop& stop) {
    due = std::max(due + period, Clock::now());
    stop.sleepUntil(due);
    return !stop.asked() && (time.count() == 0 || Clock::now() - begin < time);
  }
  double seconds() const { return std::chrono::duration<double>(Clock::now() - begin).count(); }
};

void events(Context& context, const EventOptions& options) {
  Pace pace;
  if (options.rate != 0) pace.period = periodOf(options.rate, 0.001, 1e9);
  if (!options.time.empty()) pace.time = parseDuration(options.time);
  std::vector<Signal> wanted = context.signals().select(options.names, Direction::input);
  if (wanted.empty()) throw WrongUse("no inputs that could change");
  Poller& poller = context.board().poller();
  Subscription inputs(poller, std::move(wanted));
  poller.poll();
  inputs.look();  // what moved before is no event
  context.board().markSeen({});
  const Context::Stoppable stop(context);
  pace.begin = pace.due = Clock::now();
  for (std::uint64_t count = 0; pace.await(stop);) {
    poller.poll();
    const std::vector<Sample>& samples = inputs.look();
    std::string lines;
    for (const Signal& each : inputs.inputs()) {
      if (!hasMoved(each, samples[each.core])) continue;
      lines += lineOf(each, samples[each.core], pace.seconds(), context.settings.json);
      if (++count == options.count) break;
    }
    context.board().markSeen(inputs.inputs());
    if (!os::writeOutput(lines, stop) || (count == options.count && count != 0)) break;
  }
}

}  // namespace

void addEvents(CLI::App& app, Context& context) {
  auto options = std::make_shared<EventOptions>();
  CLI::App* command = app.add_subcommand("events", "a line for each change of an input, as it comes");
  command->add_option("INPUT", options->names, "inputs; without a name all of them");
  command->add_option("--count", options->count, "how many; without a number until it is stopped")
      ->check(wholeNumber(1, 1'000'000'000'000));
  command->add_option("--for", options->time, "how long, such as 10s")->type_name("TIME");
  command->add_option("--rate", options->rate, "polls per second; without it as many as the cable allows");
  command->footer(
      "A line is the time in seconds since the start, the name, the value, and what the input did since the "
      "poll before: "
      "rise,\nfall or both, though the value be the same again. With --json, a line of JSON.\n\n"
      "Example:\n  qorvio --core 1.1.0 events async_in_data --count 3");
  command->callback([&context, options] { events(context, *options); });
}

}  // namespace qor::tool
