#include "board/Board.h"

#include "board/model/CoreAddress.h"
#include "board/model/Duration.h"
#include "board/session/LocalCore.h"

namespace qor {
namespace {

using Clock = std::chrono::steady_clock;

SignalTable fileOf(const std::string& path) {
  return path.empty() ? SignalTable() : readSignalFile(path);
}

// Which core counts, of the one that was asked for and the one that the file names.
void chooseFirstCore(SignalTable& signals, const BoardOptions& options, Link& link) {
  if (options.core && !signals.cores().empty() && !isSame(*options.core, signals.cores().front()) &&
      !options.forceCore)
    throw WrongUse(signals.file() + ": the signals are for core " + refText(signals.cores().front()) +
                   ", asked for is: " + refText(*options.core));
  if (options.core) signals.setFirstCore(*options.core);
  if (signals.cores().empty()) signals.setFirstCore(firstVioCore(link));
}

std::string lastSeen(const Condition& condition, const std::vector<Sample>& samples) {
  std::string text;
  Bytes value;
  for (const Signal& each : condition.signals()) {
    extract(each, samples[each.core].values(each.port), value);
    text += (text.empty() ? "" : ", ") + each.name + " is " + shown(each, value);
  }
  return text;
}

}  // namespace

Board::Board(const std::string& url, const std::string& signalsFile, BoardOptions options)
    : options_(std::move(options)) {
  SignalTable signals = fileOf(signalsFile);  // before the cable: what is wrong in it needs no board
  link_ = std::make_unique<Link>(openCable(url, options_.stop), url);
  open(std::move(signals));
}

Board::Board(std::unique_ptr<QorRT::Qor_Cable> cable, SignalTable signals, BoardOptions options)
    : Board(std::make_unique<Link>(std::move(cable)), std::move(signals), std::move(options)) {}

Board::Board(std::unique_ptr<Link> link, SignalTable signals, BoardOptions options)
    : options_(std::move(options)), link_(std::move(link)) {
  open(std::move(signals));
}

Board::~Board() {
  try {
    if (reads_) markSeen({});
    for (std::size_t core = 0; core < unseen_.size(); ++core) cores_[core]->keepActivity(unseen_[core]);
  } catch (const std::exception&) {  // out of memory: then it is lost
    return;
  }
}

void Board::open(SignalTable signals) {
  chooseFirstCore(signals, options_, *link_);
  std::vector<Core*> cores;
  std::vector<QORVIO_CORE_INFO> infos;
  for (QOR_CORE_REF ref : signals.cores()) {
    cores_.push_back(
        std::make_unique<LocalCore>(*link_, ref, SharedState{options_.stateFolder, options_.share}));
    cores.push_back(cores_.back().get());
    infos.push_back(cores_.back()->info());
  }
  const std::vector<std::string> outside = signalsOutsideCore(signals, infos);
  if (!outside.empty()) throw WrongUse(signals.file() + ": " + outside.front());
  for (std::size_t core = 0; core < infos.size(); ++core) signals.addWholePorts(infos[core], core);
  signals_ = std::make_shared<const SignalTable>(std::move(signals));
  poller_ = std::make_unique<Poller>(cores);
  reads_ = std::make_unique<Subscription>(*poller_);
  for (const QORVIO_CORE_INFO& info : infos) unseen_.push_back(emptySample(info));
}

void Board::give(const std::vector<Assignment>& assignments) {
  for (std::size_t core = 0; core < cores_.size(); ++core) {
    std::vector<Assignment> mine;
    for (const Assignment& each : assignments)
      if (each.signal.core == core) mine.push_back(each);
    if (!mine.empty()) cores_[core]->write(mine);
  }
}

bool Board::toggle(const std::string& output, std::optional<bool> assumed) {
  const Signal signal = signals_->find(output, Direction::output);
  const Assignment assignment = toggled(core(signal.core), signal, assumed);
  give({assignment});
  return assignment.steps.front().front() != 0;
}

void Board::rememberOutputs() {
  for (const auto& core : cores_) core->rememberOutputs();
}

Frame Board::read() {
  poller_->pollAll();
  Frame frame(signals_, collect());
  for (Sample& each : unseen_) forgetActivity(each);
  return frame;
}

Frame Board::read(const std::vector<Signal>& inputs) {
  const Subscription wanted(*poller_, inputs);
  poller_->poll();
  Frame frame(signals_, collect());
  for (const Signal& each : inputs) forgetActivity(unseen_[each.core], each);
  return frame;
}

void Board::markSeen(const std::vector<Signal>& inputs) {
  std::vector<Sample> fresh = reads_->look();
  for (const Signal& each : inputs) forgetActivity(fresh[each.core], each);
  for (std::size_t core = 0; core < fresh.size(); ++core) addActivity(unseen_[core], fresh[core]);
}

// The newest values, with all activity that nobody has seen.
const std::vector<Sample>& Board::collect() {
  const std::vector<Sample>& fresh = reads_->look();
  for (std::size_t core = 0; core < fresh.size(); ++core) {
    unseen_[core].asyncIn = fresh[core].asyncIn;
    unseen_[core].syncIn = fresh[core].syncIn;
    addActivity(unseen_[core], fresh[core]);
  }
  return unseen_;
}

Frame Board::waitFor(const Condition& condition, std::chrono::nanoseconds timeout) {
  Subscription subscription(*poller_);
  const Clock::time_point begin = Clock::now();
  for (;;) {
    poller_->pollAll();
    const std::vector<Sample>& samples = subscription.look();
    if (condition.isTrue(samples)) return {signals_, samples};
    if (options_.stop && options_.stop())
      throw Stopped("interrupted while waiting for " + condition.text() + ": " +
                    lastSeen(condition, samples));
    if (Clock::now() - begin >= timeout)
      throw Timeout("not within " + durationText(timeout) + ": " + condition.text() + "; " +
                    lastSeen(condition, samples));
  }
}

Frame Board::waitFor(const std::string& input, const Value& value, std::chrono::nanoseconds timeout) {
  return waitFor(Condition::compare(signals_->find(input, Direction::input), Relation::equal, value),
                 timeout);
}

}  // namespace qor
