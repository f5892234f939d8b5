// A board that Python threads share: one of them is in the engine at a time, without the GIL. One that waits lets others in
// between two polls.
#pragma once

#include <pybind11/pybind11.h>

#include <atomic>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "bindings/python/Names.h"
#include "board/Board.h"

namespace qor::python {

/// What a watch looks at all cores with. Its board frees it, at the first call after it was dropped, or when it is closed.
struct Watcher {
  std::unique_ptr<Subscription> subscription;
  std::atomic<bool> isDropped{false};
};

class Session {
 public:
  /// Opens a board on a cable's URL, or on a cable when that is not null. `core` may be empty.
  Session(const std::string& url, std::unique_ptr<QorRT::Qor_Cable> cable, const std::string& signals,
          const std::string& core, const std::string& stateFolder);
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;
  ~Session();

  /// Ends what other threads wait for, and closes the link once they are out. A board of a parent process is only let go.
  void close();

  bool isClosed() const { return isClosing_; }
  const std::string& url() const { return url_; }
  Names& names() { return *names_; }
  const std::shared_ptr<Names>& sharedNames() const { return names_; }

  /// What the inputs are now, for work(board) in run(): without a look at it, so that it takes no activity, of all cores or
  /// of one; or with a look. Valid until the next poll.
  /// @{
  const std::vector<Sample>& peek(Board& board);
  const Sample& peek(Board& board, std::size_t core);
  const std::vector<Sample>& look(Board& board);
  /// @}

  std::shared_ptr<Watcher> watch();

  /// Sleeps without the engine and the GIL; false when `isEnded` or close() ends it. Throws what a signal handler raises.
  bool sleepUntil(std::chrono::steady_clock::time_point due, const std::atomic<bool>& isEnded);

  /// Runs `work(board)` as the only thread in the engine, with the GIL released. Throws what the engine throws; in the
  /// place of that, what a design or a signal handler in Python has raised.
  template <class Work>
  auto run(Work&& work) {
    Turn turn(*this);
    try {
      auto result = work(*board_);
      if (isInterrupted_) turn.failAsPython();
      return result;
    } catch (const Error&) {
      turn.failAsPython();
      throw;
    }
  }

 private:
  // Holds the engine, and not the GIL.
  class Turn {
   public:
    explicit Turn(Session& session, bool isLast = false);
    Turn(const Turn&) = delete;
    Turn& operator=(const Turn&) = delete;
    ~Turn();

    /// Throws what Python code has raised in this turn, if any has.
    void failAsPython();

   private:
    void await(bool isLast);
    bool tryFor(std::chrono::milliseconds time, bool isLast);

    Session& session_;
    PyThreadState* thread_;
  };

  void open(std::unique_ptr<QorRT::Qor_Cable> cable, const std::string& signals, BoardOptions options);
  bool isOfParent() const;
  void requireOutside() const;
  bool shouldStop();
  bool shouldStopBetweenPolls();  // and lets others in: the engine's state is whole then
  void letOthersIn();
  void freeDropped();

  std::string url_;
  int fork_;
  std::atomic<bool> isClosing_{false};  // nothing new begins, and what goes on ends
  bool isEnding_ = false;               // nothing goes on any more but the closing
  std::timed_mutex engine_;
  std::atomic<std::thread::id> owner_{};
  std::atomic<int> waiting_{0};    // threads that want the engine
  std::atomic<unsigned> took_{0};  // how often one of them has got it
  std::atomic<int> inside_{0};     // turns begun and not ended, those that let others in among them
  int turns_ = 0;                  // the same, until they have the GIL again
  std::chrono::steady_clock::time_point lastHeard_{};
  bool isInterrupted_ = false;
  std::unique_ptr<Board> board_;
  std::unique_ptr<Subscription> reads_;
  std::vector<std::shared_ptr<Watcher>> watchers_;
  std::shared_ptr<Names> names_;
};

/// Keeps what Python code, called by the engine on this thread, has raised, for the call that led there.
void keepRaised(py::error_already_set&& raised);

}  // namespace qor::python
