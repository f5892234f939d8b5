#include <unistd.h>
#include <chrono>
#include <cstdio>
#include <sstream>

#include "Activity.h"
#include "Commands.h"
#include "Errors.h"
#include "Stop.h"
#include "Table.h"
#include "Terminal.h"

namespace tool {
namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::milliseconds;

struct WatchOptions {
  std::vector<std::string> names;
  double rate = 10;
  std::uint64_t frames = 0;
};

// What is watched, what it did, and which output the keys drive.
class Watch {
 public:
  Watch(CoreSession& core, const SignalTable& signals, const std::vector<std::string>& names)
      : core_(core), inputs_(signals.select(names, Direction::input)), sample_(core.emptySample()) {
    since_.resize(inputs_.size());
    for (const Signal& each : signals.select({}, Direction::output)) addBits(signals, each);
  }

  void poll() {
    core_.read(sample_);
    ++frames_;
    for (std::size_t i = 0; i < inputs_.size(); ++i) {
      const Activity activity = activityOf(inputs_[i], sample_);
      since_[i].up |= activity.up;
      since_[i].down |= activity.down;
    }
  }

  void press(char key) {
    if (key == 0) return;
    status_.clear();
    if (key == 'j' && chosen_ + 1 < outputs_.size()) ++chosen_;
    if (key == 'k' && chosen_ > 0) --chosen_;
    if (key == 'c') since_.assign(inputs_.size(), {});
    if ((key != ' ' && key != 'p') || outputs_.empty()) return;
    try {
      const Signal& output = outputs_[chosen_];
      core_.write({key == ' ' ? toggle(core_, output) : pulse(output, 0, 1)});
    } catch (const WrongUse& error) {
      status_ = error.what();
    }
  }

  std::vector<std::string> lines(bool withKeys) const {
    std::vector<std::string> lines = linesOf(inputTable());
    if (!withKeys) return lines;
    lines.emplace_back();
    for (const std::string& line : linesOf(outputTable())) lines.push_back(line);
    lines.emplace_back();
    lines.push_back("frame " + std::to_string(frames_) +
                    "   j k choose, space toggle, p pulse, c clear, q quit");
    lines.push_back(status_);
    return lines;
  }

 private:
  // Keys drive single bits: the bits of wider outputs one by one.
  void addBits(const SignalTable& signals, const Signal& output) {
    if (output.width() == 1) return outputs_.push_back(output);
    for (unsigned bit = 0; bit < output.width(); ++bit)
      outputs_.push_back(signals.find(output.name + "[" + std::to_string(bit) + "]", Direction::output));
  }

  static std::vector<std::string> linesOf(const Table& table) {
    std::istringstream text(table.text());
    std::vector<std::string> lines;
    for (std::string line; std::getline(text, line);) lines.push_back(line);
    return lines;
  }

  Table inputTable() const {
    Table table({"INPUT", "VALUE", "ACTIVITY", "SYNC", "SINCE START"});
    Bytes value;
    for (std::size_t i = 0; i < inputs_.size(); ++i) {
      const Activity activity = activityOf(inputs_[i], sample_);
      extract(inputs_[i], sample_.values(inputs_[i].port), value);
      table.add({inputs_[i].name, shown(inputs_[i], value), arrow(activity.up, activity.down),
                 inputs_[i].port == Port::syncIn ? arrow(activity.syncUp, activity.syncDown) : "",
                 arrow(since_[i].up, since_[i].down)});
    }
    return table;
  }

  Table outputTable() const {
    Table table({"  OUTPUT", "LAST GIVEN"});
    for (std::size_t i = 0; i < outputs_.size(); ++i)
      table.add({(i == chosen_ ? "> " : "  ") + outputs_[i].name,
                 shown(outputs_[i], core_.lastWritten(outputs_[i]))});
    return table;
  }

  CoreSession& core_;
  std::vector<Signal> inputs_;
  std::vector<Signal> outputs_;
  std::vector<Activity> since_;
  Sample sample_;
  std::string status_;
  std::size_t chosen_ = 0;
  std::uint64_t frames_ = 0;
};

milliseconds until(Clock::time_point due) {
  return std::max(milliseconds(0), std::chrono::duration_cast<milliseconds>(due - Clock::now()));
}

void runOnTerminal(Watch& watch, const WatchOptions& options, Clock::duration period) {
  const Stop stop;
  Terminal terminal;
  Clock::time_point due = Clock::now();
  for (std::uint64_t frame = 0; !stop.asked() && (options.frames == 0 || frame < options.frames); ++frame) {
    watch.poll();
    terminal.show(watch.lines(true));
    due = std::max(due + period, Clock::now());
    do {
      const char key = terminal.key(until(due));
      if (key == 'q') return;
      watch.press(key);
    } while (!stop.asked() && Clock::now() < due);
  }
}

void runPlain(Watch& watch, const WatchOptions& options, Clock::duration period) {
  const Stop stop;
  for (std::uint64_t frame = 0; !stop.asked() && (options.frames == 0 || frame < options.frames); ++frame) {
    if (frame != 0)
      usleep(static_cast<useconds_t>(std::chrono::duration_cast<std::chrono::microseconds>(period).count()));
    watch.poll();
    for (const std::string& line : watch.lines(false)) std::printf("%s\n", line.c_str());
    std::printf("\n");
    std::fflush(stdout);
  }
}

void runWatch(Context& context, const WatchOptions& options) {
  if (!(options.rate >= 0.01) || options.rate > 1000)
    throw WrongUse("a rate is 0.01 to 1000 frames a second: " + std::to_string(options.rate));
  const auto period =
      std::chrono::duration_cast<Clock::duration>(std::chrono::duration<double>(1 / options.rate));
  CoreSession& core = context.core();
  Watch watch(core, context.signals(), options.names);
  const bool onTerminal = isatty(STDIN_FILENO) != 0 && isatty(STDOUT_FILENO) != 0;
  try {
    (onTerminal ? runOnTerminal : runPlain)(watch, options, period);
  } catch (const Failure&) {  // the screen is gone: leave the last values where they can be seen
    if (onTerminal)
      for (const std::string& line : watch.lines(false)) std::printf("%s\n", line.c_str());
    throw;
  }
}

}  // namespace

void addWatch(CLI::App& app, Context& context) {
  auto options = std::make_shared<WatchOptions>();
  CLI::App* command = app.add_subcommand("watch", "inputs in a live table; keys toggle and pulse outputs");
  command->add_option("NAME", options->names, "inputs; all when none is named");
  command->add_option("--rate", options->rate, "frames a second");
  command->add_option("--frames", options->frames, "how many; without end when it is not given");
  command->footer(
      "Keys: j k choose an output bit, space toggles it, p pulses it, c clears, q quits.\n\n"
      "Example:\n  qorvio watch --rate 20");
  command->callback([&context, options] { runWatch(context, *options); });
}

}  // namespace tool
