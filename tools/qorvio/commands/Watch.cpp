#include <chrono>
#include <cstdio>
#include <utility>

#include "board/model/Duration.h"
#include "board/model/Errors.h"
#include "os/StandardStreams.h"
#include "os/Stop.h"
#include "os/Terminal.h"
#include "tools/qorvio/InputJson.h"
#include "tools/qorvio/InputWatch.h"
#include "tools/qorvio/LiveWatch.h"
#include "tools/qorvio/Number.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/WatchLayout.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/WatchTables.h"

namespace qor::tool {
namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::milliseconds;

struct WatchOptions {
  std::vector<std::string> names;
  double rate = 10;
  std::uint64_t frames = 0;
};

// When frames are due: at the rate, or later where the link is slower.
class Frames {
 public:
  Frames(Clock::duration period, std::uint64_t count) : period_(period), count_(count) {}

  /// Whether another one is wanted after so many.
  bool goesOn(std::uint64_t frames) const { return !stop_.asked() && (count_ == 0 || frames < count_); }
  void begin() { due_ = std::max(due_ + period_, Clock::now()); }
  void wait(Clock::duration time) { due_ = std::max(due_, Clock::now() + time); }
  bool isOver() const { return stop_.asked() || Clock::now() >= due_; }
  void sleep() const { stop_.sleepUntil(due_); }
  const os::Stop& stop() const { return stop_; }

  // Short enough for a signal that no wait saw.
  milliseconds nap() const {
    return std::clamp(std::chrono::ceil<milliseconds>(due_ - Clock::now()), milliseconds(0),
                      milliseconds(50));
  }

 private:
  const os::Stop stop_;
  Clock::duration period_;
  std::uint64_t count_;
  Clock::time_point due_ = Clock::now();
};

// On a link that is slower than the rate, keys are to be obeyed as fast as they come, and frames still to be seen.
constexpr int keysAtOnce = 16;

// Shows the frame and what the keys make of it until the next one is due; false when that is not wanted.
bool showWithKeys(LiveWatch& live, os::Terminal& terminal, const Frames& frames) {
  do {
    if (terminal.takeResized()) live.redraw();
    if (!terminal.write(live.update(terminal.size()))) return false;
    milliseconds wait = frames.nap();
    for (int i = 0; i < keysAtOnce; ++i, wait = milliseconds(0)) {
      const os::Key key = terminal.key(wait);
      if (key == os::noKey) break;
      if ((key == 'q' && !live.isTyping()) || key == os::endOfKeys) return false;
      live.press(key);
    }
  } while (!frames.isOver());
  return true;
}

// What the link says while it is lost, and nothing else.
class LostLink {
 public:
  // False, with the words kept, when it fails; a second is enough between two tries.
  bool poll(InputWatch& watch, LiveWatch& live, Frames& frames) {
    try {
      watch.poll();
    } catch (const Busy&) {
      throw;
    } catch (const Failure& failure) {
      words_ = failure.what();
      live.say(words_ + "; trying again");
      frames.wait(std::chrono::seconds(1));
      return false;
    }
    if (!words_.empty()) live.say("");
    words_.clear();
    return true;
  }

  const std::string& words() const { return words_; }

 private:
  std::string words_;
};

void runOnTerminal(InputWatch& watch, LiveWatch& live, Frames& frames) {
  LostLink lost;
  watch.poll();  // a link that was never there is no lost one
  try {
    os::Terminal terminal(frames.stop());
    bool isFirst = true;
    while (isFirst || frames.goesOn(watch.frames())) {
      frames.begin();
      if (std::exchange(isFirst, false) || lost.poll(watch, live, frames)) live.keep();
      if (!showWithKeys(live, terminal, frames)) break;
    }
    if (!lost.words().empty()) throw Failure(lost.words());
  } catch (const std::exception&) {  // the screen is gone: leave the last frame where it can be seen
    std::printf("%s", live.shown().c_str());
    throw;
  }
}

// Frames as text, one after another.
template <class Text>
void print(InputWatch& watch, Frames& frames, Text text) {
  while (frames.goesOn(watch.frames())) {
    frames.begin();
    watch.poll();
    if (!os::writeOutput(text(), frames.stop())) return;
    if (frames.goesOn(watch.frames())) frames.sleep();
  }
}

void printTables(InputWatch& watch, Frames& frames) {
  constexpr auto unlimited = static_cast<std::size_t>(-1);
  InputTable table(watch);
  print(watch, frames, [&] {
    std::string text;
    for (const std::string& line : table.lines(watch, unlimited)) text += line + '\n';
    return text + '\n';
  });
}

void printJson(InputWatch& watch, Frames& frames) {
  std::vector<std::string> entries(watch.inputs().size());
  const Clock::time_point begin = Clock::now();
  print(watch, frames, [&] {
    for (std::size_t i : watch.takeChanged()) {
      const Signal& input = watch.inputs()[i];
      nlohmann::ordered_json entry = jsonOf(input, watch.sample(input));
      addActivity(entry, input, watch.sinceStart(input), "_since_start");
      entries[i] = jsonLine(entry);
    }
    const auto time = std::chrono::duration_cast<std::chrono::microseconds>(Clock::now() - begin);
    std::string text = "{\"frame\":" + std::to_string(watch.frames()) +
                       ",\"time_s\":" + std::to_string(static_cast<double>(time.count()) / 1e6) +
                       ",\"inputs\":[";
    for (std::size_t i = 0; i < entries.size(); ++i) (text += i == 0 ? "" : ",") += entries[i];
    return text + "]}\n";
  });
}

void show(Context& context, InputWatch& watch, Frames& frames) {
  if (context.settings.json) return printJson(watch, frames);
  if (!os::isTerminal(os::Stream::input) || !os::isTerminal(os::Stream::output))
    return printTables(watch, frames);
  LiveWatch live(watch, OutputTable(context.board()));
  const WatchLayout layout(context.cable());
  layout.restore(live);
  runOnTerminal(watch, live, frames);
  layout.keep(live);
}

void runWatch(Context& context, const WatchOptions& options) {
  const Clock::duration period = periodOf(options.rate, 0.001, 1e9);
  InputWatch watch(context.board().poller(), context.signals().select(options.names, Direction::input));
  Frames frames(period, options.frames);
  show(context, watch, frames);
  context.board().markSeen(watch.inputs());
  if (watch.frames() < options.frames) context.endBySignal(frames.stop().signal());
}

}  // namespace

void addWatch(CLI::App& app, Context& context) {
  auto options = std::make_shared<WatchOptions>();
  CLI::App* command = app.add_subcommand("watch", "inputs in a live table; keys toggle and pulse outputs");
  command->add_option("INPUT", options->names, "inputs; without a name all of them");
  command->add_option("--rate", options->rate, "frames per second")->capture_default_str();
  command->add_option("--frames", options->frames, "how many; without a number until it is stopped")
      ->check(wholeNumber(1, 1'000'000'000'000));
  command->footer(
      "Keys: j k choose an output, space toggles a bit, p pulses it, = or Enter takes a value (with commas a "
      "pulse "
      "train),\n"
      "h shows the latest frames, c clears, arrows, PgUp, PgDn, Home and End scroll, q quits. A lost link is "
      "tried "
      "again;\n"
      "the chosen output and h are remembered per board. Without a terminal the table is printed frame after "
      "frame, with --json a line of JSON a "
      "frame.\n"
      "Ctrl-C quits as q does, with 0; before the last one of --frames with 130.\n\n"
      "Example:\n  qorvio watch --rate 20\n  qorvio --json watch --frames 3 async_in_data");
  command->callback([&context, options] { runWatch(context, *options); });
}

}  // namespace qor::tool
