#include "bindings/python/Session.h"

#include <pthread.h>

#include <algorithm>
#include <exception>

#include "board/model/CoreAddress.h"

namespace qor::python {
namespace {

using Clock = std::chrono::steady_clock;
constexpr std::chrono::milliseconds heard(50);  // how long Ctrl-C may go unheard

std::atomic<int> forks{0};
const int forkHandler = pthread_atfork(nullptr, nullptr, [] { ++forks; });

// Of this thread: what Python code has raised below the engine. Used with the GIL.
thread_local PyObject* raisedType = nullptr;
thread_local PyObject* raisedValue = nullptr;
thread_local PyObject* raisedTrace = nullptr;

void forgetRaised() {
  Py_CLEAR(raisedType);
  Py_CLEAR(raisedValue);
  Py_CLEAR(raisedTrace);
}

// With the GIL. True leaves the exception of the handler pending.
bool isInterrupted() {
  return PyErr_CheckSignals() != 0;
}

BoardOptions optionsOf(const std::string& core, const std::string& stateFolder, StopFunction stop) {
  BoardOptions options;
  if (!core.empty()) options.core = parseRef(core);
  options.stateFolder = stateFolder;
  options.stop = std::move(stop);
  return options;
}

SignalTable tableOf(const std::string& path) {
  return path.empty() ? SignalTable() : readSignalFile(path);
}

}  // namespace

void keepRaised(py::error_already_set&& raised) {
  forgetRaised();
  raised.restore();
  PyErr_Fetch(&raisedType, &raisedValue, &raisedTrace);
}

Session::Session(const std::string& url, std::unique_ptr<QorRT::Qor_Cable> cable, const std::string& signals,
                 const std::string& core, const std::string& stateFolder)
    : url_(url), fork_(forks) {
  static_cast<void>(forkHandler);
  open(std::move(cable), signals, optionsOf(core, stateFolder, [this] { return shouldStopBetweenPolls(); }));
  names_ = std::make_shared<Names>(board_->signals());
}

void Session::open(std::unique_ptr<QorRT::Qor_Cable> cable, const std::string& signals,
                   BoardOptions options) {
  Turn turn(*this);
  try {
    SignalTable table = tableOf(signals);  // before the cable: what is wrong in it needs no board
    if (cable == nullptr) cable = openCable(url_, [this] { return shouldStop(); });
    board_ = std::make_unique<Board>(std::make_unique<Link>(std::move(cable), url_), std::move(table),
                                     std::move(options));
    reads_ = std::make_unique<Subscription>(board_->poller());
  } catch (const Error&) {
    turn.failAsPython();
    throw;
  }
}

Session::~Session() {
  try {
    close();
  } catch (const std::exception&) {  // there is nobody to report it to
  }
}

bool Session::isOfParent() const {
  return fork_ != forks;
}

void Session::close() {
  if (isClosing_) return;
  requireOutside();
  isClosing_ = true;
  if (isOfParent()) {  // its link is the parent's, and so is what its outputs are remembered by
    static_cast<void>(board_.release());
    static_cast<void>(reads_.release());
    for (const auto& each : watchers_) static_cast<void>(each->subscription.release());
    return;
  }
  {
    Turn turn(*this, true);
    isEnding_ = true;
    for (const auto& each : watchers_) each->subscription.reset();  // their watches may live on
    watchers_.clear();
    reads_.reset();
    board_.reset();
  }
  while (turns_ != 0) {  // they still need the GIL, which an interpreter that ends would refuse
    const py::gil_scoped_release released;
    std::this_thread::sleep_for(std::chrono::milliseconds(1));
  }
}

const std::vector<Sample>& Session::peek(Board& board) {
  board.poller().pollAll();
  return reads_->pending();
}

const Sample& Session::peek(Board& board, std::size_t core) {
  board.poller().poll(core);
  return reads_->pending()[core];
}

const std::vector<Sample>& Session::look(Board& board) {
  board.poller().pollAll();
  return reads_->look();
}

std::shared_ptr<Watcher> Session::watch() {
  return run([&](Board& board) {
    auto watcher = std::make_shared<Watcher>();
    watcher->subscription = std::make_unique<Subscription>(board.poller());
    watchers_.push_back(watcher);
    return watcher;
  });
}

bool Session::sleepUntil(Clock::time_point due, const std::atomic<bool>& isEnded) {
  while (!isClosing_ && !isEnded && Clock::now() < due) {
    {
      const py::gil_scoped_release released;
      std::this_thread::sleep_until(std::min(due, Clock::now() + heard / 5));
    }
    if (isInterrupted()) throw py::error_already_set();
  }
  return !isEnded;
}

void Session::freeDropped() {
  const auto kept = std::partition(watchers_.begin(), watchers_.end(),
                                   [](const std::shared_ptr<Watcher>& each) { return !each->isDropped; });
  std::for_each(kept, watchers_.end(), [](const auto& each) { each->subscription.reset(); });
  watchers_.erase(kept, watchers_.end());
}

void Session::requireOutside() const {
  if (owner_ == std::this_thread::get_id() && !isOfParent())
    throw WrongUse("the board is at work for this thread: a design or a signal handler cannot use it");
}

bool Session::shouldStopBetweenPolls() {
  if (waiting_ != 0 && !isClosing_) letOthersIn();
  return shouldStop();
}

bool Session::shouldStop() {
  if (isClosing_) return !isEnding_;
  const Clock::time_point now = Clock::now();
  if (now - lastHeard_ < heard) return false;
  lastHeard_ = now;
  const py::gil_scoped_acquire acquired;
  isInterrupted_ = isInterrupted();
  return isInterrupted_;
}

void Session::letOthersIn() {
  const unsigned before = took_;
  owner_ = std::thread::id();
  engine_.unlock();
  while (!isClosing_ && waiting_ != 0 && took_ == before)
    std::this_thread::sleep_for(std::chrono::microseconds(20));
  engine_.lock();
  owner_ = std::this_thread::get_id();
}

Session::Turn::Turn(Session& session, bool isLast) : session_(session) {
  if (session.isOfParent()) throw WrongUse("the board was opened by the parent of this process");
  session.requireOutside();
  await(isLast);
  if (session.isClosing_ && !isLast) {
    session.engine_.unlock();
    throw WrongUse("the board is closed");
  }
  forgetRaised();
  ++session.inside_;
  ++session.turns_;
  thread_ = PyEval_SaveThread();
  session.owner_ = std::this_thread::get_id();
  session.isInterrupted_ = false;
  session.freeDropped();
}

// Until no other thread is in the engine; for the last turn, until no other turn has begun.
void Session::Turn::await(bool isLast) {
  if (tryFor({}, isLast)) return;
  ++session_.waiting_;
  bool isFree = false, isOver = false;
  while (!isFree && !isOver) {
    {
      const py::gil_scoped_release released;
      isFree = tryFor(heard, isLast);
    }
    isOver = !isFree && !isLast && isInterrupted();
  }
  ++session_.took_;
  --session_.waiting_;
  if (isOver) throw py::error_already_set();
}

bool Session::Turn::tryFor(std::chrono::milliseconds time, bool isLast) {
  if (!session_.engine_.try_lock_for(time)) return false;
  if (!isLast || session_.inside_ == 0) return true;
  session_.engine_.unlock();
  std::this_thread::sleep_for(std::chrono::milliseconds(1));
  return false;
}

Session::Turn::~Turn() {
  session_.owner_ = std::thread::id();
  --session_.inside_;
  session_.engine_.unlock();
  PyEval_RestoreThread(thread_);
  --session_.turns_;
}

void Session::Turn::failAsPython() {
  const py::gil_scoped_acquire acquired;
  if (raisedType != nullptr) {
    PyErr_Restore(raisedType, raisedValue, raisedTrace);
    raisedType = raisedValue = raisedTrace = nullptr;
  }
  if (PyErr_Occurred() != nullptr) throw py::error_already_set();
}

}  // namespace qor::python
