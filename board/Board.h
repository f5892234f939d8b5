/// @file
/// A board, its cores and their signals by name: all that most hosts need.
///
///     qor::Board board("sim:", "lab.toml");
///     board.write({{"leds", 0xA}, {"go", qor::pulse(3)}});  // one exchange per core
///     const qor::Frame frame = board.read();                // one snapshot per core
///     if (frame["ready"].rose()) ...
///     board.waitFor("state", "RUN", 2s);                    // throws what it saw last
///
/// Conventions
///
///  1. Failures are exceptions (board/model/Errors.h): WrongUse and UnknownSignal before anything is sent, Failure of the
///     link, Timeout and Stopped of a wait.
///  2. A board is used by one thread at a time.
///  3. Nothing is printed, no signal handler installed, no state kept but where BoardOptions says.
#pragma once

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "board/Export.h"
#include "board/model/Assignment.h"
#include "board/model/Condition.h"
#include "board/model/Errors.h"
#include "board/model/Frame.h"
#include "board/model/SignalFile.h"
#include "board/model/SignalTable.h"
#include "board/record/Poller.h"
#include "board/session/Core.h"
#include "board/session/Link.h"
#include "board/session/Stop.h"

namespace qor {

struct BoardOptions {
  /// The first core: of the signals that name none, and of the whole ports. When it is not given, the one that the signals
  /// file names, else the first VIO core.
  std::optional<QOR_CORE_REF> core{};

  /// Whether `core` counts though the signals file names another one; otherwise that is wrong use.
  bool forceCore = false;

  /// Where to remember what outputs were given, to keep activity that was read and not asked for, and to claim the cores
  /// that are read; empty: nowhere. userStateFolder() is the one of the command line.
  std::string stateFolder{};

  /// Read cores though other hosts that use the same state folder do: then each misses activity that another one took.
  bool share = false;

  /// Interrupts waits: those for a condition, and those for the server of a cable that the board itself opens, which fail
  /// then.
  StopFunction stop{};
};

class QORBOARD_API Board {
 public:
  /// Opens the cable and sets up every core that the signals file names. Without a file there are the whole ports of one
  /// core: async_out_data, sync_out_data, async_in_data, sync_in_data. Throws WrongUse and Failure.
  explicit Board(const std::string& url, const std::string& signalsFile = {}, BoardOptions options = {});

  /// The same on a cable of the caller's own, or a session that is open already. `signals` may be empty.
  /// @{
  explicit Board(std::unique_ptr<QorRT::Qor_Cable> cable, SignalTable signals = {},
                 BoardOptions options = {});
  explicit Board(std::unique_ptr<Link> link, SignalTable signals = {}, BoardOptions options = {});
  /// @}

  Board(const Board&) = delete;
  Board& operator=(const Board&) = delete;
  ~Board();

  /// The names of the file, and the whole ports of the cores.
  const SignalTable& signals() const { return *signals_; }

  /// Gives outputs their values, in one exchange per core. Throws WrongUse, with nothing sent, and Failure.
  /// @{
  void write(const std::vector<Drive>& drives) { give(assignmentsOf(drives, *signals_)); }
  void write(const std::string& output, const Value& value) { write({{output, value}}); }
  void give(const std::vector<Assignment>& assignments);
  /// @}

  /// Gives a one-bit output the opposite of what it was given last; `assumed` counts where that is not known. Returns what
  /// it was given. Throws WrongUse when it is not known and nothing is assumed.
  bool toggle(const std::string& output, std::optional<bool> assumed = {});

  /// What an output was last given, as far as is known; nothing where it is not known of every bit.
  std::optional<Bytes> lastGiven(const Signal& output) const { return core(output.core).lastGiven(output); }

  /// Keeps now what outputs were given. Throws Failure.
  void rememberOutputs();

  /// Reads all inputs, in one exchange per core. Its activity is that since the read before, in this process or in one that
  /// had the same state folder and was asked for other inputs. Throws Busy, the first time, when another host reads.
  Frame read();

  /// The same for one who asks for these inputs only: reads their cores; what other inputs did is kept for the next read.
  Frame read(const std::vector<Signal>& inputs);

  /// Of what was polled since the last read or call of this, the activity of these inputs was seen by the user; that of the
  /// others is kept for the next read, by whom ever.
  void markSeen(const std::vector<Signal>& inputs);

  /// One of them.
  Reading read(const std::string& input) { return read()[input]; }

  /// Polls until the condition is true, and returns the frame of that poll. Edges count from the last poll before the wait
  /// on; what moved meanwhile is still reported by the next read(). Throws Timeout, with what was seen last, Stopped, and
  /// Failure.
  /// @{
  Frame waitFor(const Condition& condition, std::chrono::nanoseconds timeout);
  Frame waitFor(const std::string& input, const Value& value, std::chrono::nanoseconds timeout);
  /// @}

  /// A condition of this board's signals. Throws WrongUse, with the column.
  Condition condition(std::string_view text) const { return Condition::parse(text, *signals_); }

  /// The cores, as Signal::core counts them.
  /// @{
  std::size_t coreCount() const { return cores_.size(); }
  Core& core(std::size_t index = 0) { return *cores_.at(index); }
  const Core& core(std::size_t index = 0) const { return *cores_.at(index); }
  /// @}

  /// The one reader of the inputs: whoever polls besides this class subscribes to it.
  Poller& poller() { return *poller_; }

  Link& link() { return *link_; }
  const StopFunction& stop() const { return options_.stop; }

 private:
  void open(SignalTable signals);
  const std::vector<Sample>& collect();

  BoardOptions options_;
  std::unique_ptr<Link> link_;
  std::shared_ptr<const SignalTable> signals_;
  std::vector<std::unique_ptr<Core>> cores_;
  std::unique_ptr<Poller> poller_;
  std::unique_ptr<Subscription> reads_;
  std::vector<Sample> unseen_;  // one per core: activity that was read and not asked for
};

}  // namespace qor
