#include "bindings/python/Watches.h"

#include <pybind11/stl.h>

#include <algorithm>
#include <atomic>
#include <optional>

#include "bindings/python/Frames.h"
#include "board/model/Errors.h"

namespace qor::python {
namespace {

using Clock = std::chrono::steady_clock;

Clock::duration durationOf(double seconds) {
  return std::chrono::duration_cast<Clock::duration>(std::chrono::duration<double>(seconds));
}

std::vector<Signal> inputsOf(Names& names, const py::sequence& named) {
  std::vector<Signal> inputs;
  for (const py::handle each : named) inputs.push_back(names.find(each, Direction::input).signal);
  return inputs.empty() ? names.table().select({}, Direction::input) : inputs;
}

// Looks at inputs again and again, from its making on for so many seconds, with at least so many between two polls.
class Watch {
 public:
  Watch(std::shared_ptr<Session> session, const py::sequence& names, std::optional<double> timeout,
        double period)
      : session_(std::move(session)),
        inputs_(inputsOf(session_->names(), names)),
        watcher_(session_->watch()),
        period_(durationOf(period)),
        end_(timeout ? begin_ + durationOf(*timeout) : Clock::time_point::max()) {}
  Watch(const Watch&) = delete;
  Watch& operator=(const Watch&) = delete;
  ~Watch() { watcher_->isDropped = true; }

  /// When the newest poll was, in seconds since the making of the watch.
  double elapsed() const { return std::chrono::duration<double>(polled_ - begin_).count(); }

  /// Ends, from another thread, what frame() or edges() waits for.
  void end() { isEnded_ = true; }

  /// The first frame, then the next one in which an input moved; None when the time is over.
  py::object frame() {
    std::optional<Frame> found;
    const std::shared_ptr<Names> names = session_->sharedNames();
    const std::shared_ptr<const SignalTable> table(names, &names->table());
    pollUntil([&](const std::vector<Sample>& samples) {
      const bool isWanted = isFirst_ || std::any_of(inputs_.begin(), inputs_.end(), [&](const Signal& each) {
                              return hasMoved(each, samples);
                            });
      if (isWanted) found.emplace(table, samples);
      isFirst_ = isFirst_ && !isWanted;
      return isWanted;
    });
    return found ? py::cast(BoardFrame{names, std::move(*found)}) : py::none();
  }

  /// The next poll with an edge: its time in seconds, and name, rose and fell of each input that moved; None when the time
  /// is over.
  py::object edges() {
    std::vector<std::tuple<std::string, bool, bool>> moved;
    const bool isFound = pollUntil([&](const std::vector<Sample>& samples) {
      for (const Signal& each : inputs_) {
        const Activity activity = activityOf(each, samples[each.core]);
        if (activity.up || activity.down) moved.emplace_back(each.name, activity.up, activity.down);
      }
      return !moved.empty();
    });
    if (!isFound) return py::none();
    return py::make_tuple(elapsed(), moved);
  }

 private:
  static bool hasMoved(const Signal& signal, const std::vector<Sample>& samples) {
    const Activity activity = activityOf(signal, samples[signal.core]);
    return activity.up || activity.down;
  }

  // False when the time is over, or the watch was ended. Between polls at a rate the board is free for others.
  template <class Wanted>
  bool pollUntil(Wanted isWanted) {
    for (;;) {
      if (!session_->sleepUntil(std::min(due_, end_), isEnded_)) return false;
      const Outcome outcome = session_->run([&](Board& board) { return poll(board, isWanted); });
      if (outcome != Outcome::nothingYet) return outcome == Outcome::found;
    }
  }

  enum class Outcome { nothingYet, found, over };

  // Once, or at the full rate again and again.
  template <class Wanted>
  Outcome poll(Board& board, Wanted isWanted) {
    do {
      if (board.stop()()) throw Stopped("interrupted while watching inputs");
      polled_ = Clock::now();
      if (polled_ >= end_ || isEnded_) return Outcome::over;
      due_ = std::max(due_ + period_, polled_);
      board.poller().pollAll();
      if (isWanted(watcher_->subscription->look())) return Outcome::found;
    } while (period_.count() == 0);
    return Outcome::nothingYet;
  }

  std::shared_ptr<Session> session_;
  std::vector<Signal> inputs_;
  std::shared_ptr<Watcher> watcher_;
  Clock::duration period_;
  Clock::time_point begin_ = Clock::now(), end_, due_ = begin_, polled_{};
  bool isFirst_ = true;
  std::atomic<bool> isEnded_{false};
};

}  // namespace

void bindWatches(py::module_& module) {
  py::class_<Watch>(module, "_Watch")
      .def(py::init<std::shared_ptr<Session>, py::sequence, std::optional<double>, double>())
      .def("frame", &Watch::frame)
      .def("edges", &Watch::edges)
      .def("end", &Watch::end)
      .def("elapsed", &Watch::elapsed);
}

}  // namespace qor::python
