// Attacks a core whose design clock runs beside TCK, or stops, while its inputs move, its wires damage what passes and
// other software scans; with RIVAL another host, too, whose calls come between the attempts and the scans of the first
// one's. Always: no wrong value is taken for a right one, no output has a value that nobody wrote, no activity is lost
// (two hosts on good wires get all of it between them) or invented, each pulse train is played once for a call that
// succeeds and at most once for one that fails.
#include <algorithm>
#include <cstdio>
#include <cstdlib>

#include "rtl/cosim/AttackedHost.h"
#include "rtl/cosim/FreeCore.h"
#include MODEL_HEADER

namespace {

using namespace qorrtl;
using qorsim::Bits;

constexpr unsigned width = 8, steps = 16, payloadBits = 19 * width, recordBits = 10 * width;

// A write: what its digits mean, what became of it, and when, in clocks of the round.
struct Write {
  Bits payload;
  bool succeeded;
  std::size_t begin, end;
  unsigned started, ended;  // in the order of all that started and ended

  bool digit(std::size_t at) const { return payload[payloadBits - 1 - at] != 0; }
  bool marksAsync(unsigned i) const { return digit(width + steps * width + i); }
  bool marksSync(unsigned i) const { return digit(payloadBits - width + i); }
  bool marksAnySync() const {
    for (unsigned i = 0; i < width; ++i)
      if (marksSync(i)) return true;
    return false;
  }
  unsigned asyncAfter(unsigned before) const {
    for (unsigned i = 0; i < width; ++i)
      if (marksAsync(i)) before = (before & ~(1u << i)) | unsigned{digit(i)} << i;
    return before;
  }
  unsigned syncAt(unsigned step, unsigned before) const {
    for (unsigned i = 0; i < width; ++i)
      if (marksSync(i)) before = (before & ~(1u << i)) | unsigned{digit(width + steps * i + step)} << i;
    return before;
  }
};

// One host, and what has happened since it read.
struct Reader {
  AttackedHost host;
  bool failed = false;
  unsigned moved[2] = {}, movedBefore[2] = {};  // asynchronous, synchronous
  Activity during[2] = {}, window[2] = {};      // window: since its last read that succeeded began
};

class Attack {
 public:
  Attack(unsigned seed, double rate) : random_(seed), rate_(rate) {
    core_.setRate(rate);
    for (AttackedHost* each : {&host_, &rival_.host})
      each->between = [this] { chain_.idle(random_.below(100)); };
    chain_.idle(200);
    rival_.host.synchronise();
    host_.synchronise();
    const std::optional<Answer> status = host_.status();
    if (status) status_ = status->data;
    if (RIVAL == 0) return;
    host_.interrupting = [this] { rivalActs(); };
    host_.between = [this] {
      chain_.idle(random_.below(100));
      rivalActs();
    };
  }

  const char* round() {
    readRound();
    if (wrong_ == nullptr) writeRound();
    return wrong_;
  }

  const AttackedHost& host() const { return host_; }
  const AttackedHost& rival() const { return rival_.host; }

 private:
  void setDamage(unsigned oneIn) {
    host_.setDamage(oneIn);
    rival_.host.setDamage(oneIn);
    damages_ = damages_ || oneIn != 0;
  }

  void drawDamage() {
    damages_ = false;
    setDamage(random_.oneIn(2) ? 1 + random_.below(8) : 0);
  }

  void wrong(const char* what) {
    if (wrong_ == nullptr) wrong_ = what;
  }

  // A call of the other host, while the first one is in the middle of its own.
  void rivalActs() {
    if (rivalCalls_ == 0 || !random_.oneIn(6)) return;
    const unsigned left = std::exchange(rivalCalls_, 0) - 1;
    if (reads_) read(rival_);
    if (!reads_) write(rival_.host);
    rivalCalls_ = left;
    ++rivalActed_;
  }

  // Moves inputs during some reads, then reads until nothing can be under way.
  void readRound() {
    drawDamage();
    for (unsigned port = 0; port < 2; ++port) reported_[port] = happened_[port] = {};
    core_.setMoving(4u << 2 * random_.below(4));
    rivalActed_ = 0;
    reads_ = true;
    for (unsigned i = 1 + random_.below(4); i > 0; --i) {
      rivalCalls_ = 2;
      readOrStop();
      chain_.idle(random_.below(50));
    }
    rivalCalls_ = 0;
    core_.setMoving(0);
    settle();
    const bool mayLose = damages_ && rivalActed_ > 0;  // what the one failed to get home, the other replaced
    setDamage(0);
    if (rivalActed_ > 0) readAtLast(rival_);
    readAtLast(first_);
    for (unsigned port = 0; port < 2 && !mayLose; ++port)
      if (!happened_[port].within(reported_[port])) wrong("activity is lost");
  }

  void readAtLast(Reader& reader) {
    read(reader);
    if (reader.failed) wrong("a read fails on good wires");
  }

  void readOrStop() {
    const bool stops = random_.oneIn(8) && core_.moving();
    if (stops) core_.setRateIn(random_.below(300), 0);
    read(first_);
    if (stops && !stoppedStatusAnswers()) wrong("no status from a stopped clock");
    core_.setRate(rate_);
  }

  void read(Reader& reader) {
    const std::optional<Answer> answer = reader.host.read();
    reader.failed = !answer;
    noteInputs();
    std::size_t end = recordBits;
    for (unsigned port = 0; port < 2; ++port) {
      if (answer) judge(reader, *answer, port, end);
      if (answer) reader.window[port] = {};
      reader.window[port].add(std::exchange(reader.during[port], {}));
      reader.movedBefore[port] = std::exchange(reader.moved[port], 0);
    }
  }

  void noteInputs() {
    Port* const ports[] = {&core_.asyncIn, &core_.syncIn};
    for (unsigned port = 0; port < 2; ++port) {
      const unsigned moved = ports[port]->takeMoved();
      const Activity happened = ports[port]->takeHappened();
      happened_[port].add(happened);
      for (Reader* each : {&first_, &rival_}) {
        each->moved[port] |= moved;
        each->during[port].add(happened);
      }
    }
  }

  void judge(const Reader& reader, const Answer& answer, unsigned port, std::size_t& end) {
    const unsigned pins = port == 0 ? core_.model().async_in : core_.model().sync_in;
    unsigned values = 0;
    Activity reported;
    for (unsigned i = 0; i < width; ++i, end -= port == 0 ? 4 : 6) {
      values |= unsigned{answer.data[end - 1]} << i;
      reported.up |= unsigned{answer.data[end - 2]} << i;
      reported.down |= unsigned{answer.data[end - 3]} << i;
    }
    Activity allowed = reader.window[port];
    allowed.add(reader.during[port]);
    if ((answer.flags & Answer::overlap) != 0) allowed.add(lastReported_[port]);
    lastReported_[port] = reported;
    reported_[port].add(reported);
    if (((values ^ pins) & ~(reader.moved[port] | reader.movedBefore[port])) != 0) wrong("a value is wrong");
    if (!reported.within(allowed)) wrong("activity is invented");
  }

  bool stoppedStatusAnswers() {
    core_.setRate(0);
    rivalCalls_ = 0;
    setDamage(0);
    const std::optional<Answer> status = host_.status();
    return status && status->data == status_;
  }

  // Some writes, of which none waits for the one before it, and what they must have done.
  void writeRound() {
    drawDamage();
    settle();
    core_.takeSyncOuts();
    asyncBefore_ = core_.takeAsyncOuts().back();
    syncBefore_ = core_.model().sync_out;
    writes_.clear();
    start_ = core_.clocks();
    reads_ = false;
    rivalCalls_ = 2;
    for (unsigned i = 1 + random_.below(3); i > 0; --i) {
      if (random_.oneIn(6)) core_.setRateIn(random_.below(800), random_.oneIn(2) ? 0 : rate_);
      write(host_);
    }
    rivalCalls_ = 0;
    core_.setRate(rate_);
    settle();
    asyncOuts_ = core_.takeAsyncOuts();
    syncOuts_ = core_.takeSyncOuts();
    unsigned obeyed = 0;
    while (obeyed < 1u << writes_.size() && !explains(obeyed)) ++obeyed;
    if (obeyed == 1u << writes_.size()) wrong("outputs are wrong");
    resynchronise();
  }

  void write(AttackedHost& host) {
    Write write{random_.bits(payloadBits), false, core_.clocks() - start_, 0, ++events_, 0};
    if (random_.oneIn(4)) std::fill_n(write.payload.begin(), width, static_cast<unsigned char>(0));
    write.succeeded = host.write(write.payload);
    write.end = core_.clocks() - start_;
    write.ended = ++events_;
    writes_.push_back(write);
  }

  // After eight failed writes in a row a host takes another tag; these make sure of their own.
  void resynchronise() {
    setDamage(0);
    for (AttackedHost* each : {&rival_.host, &host_})
      if (!each->synchronise()) wrong("no write goes through on good wires");
  }

  bool explains(unsigned obeyed) const {
    std::vector<const Write*> order;
    for (std::size_t i = 0; i < writes_.size(); ++i) {
      if ((obeyed >> i & 1) != 0)
        order.push_back(&writes_[i]);
      else if (writes_[i].succeeded)
        return false;
    }
    do {
      if (isPossible(order) && explains(order)) return true;
    } while (std::next_permutation(order.begin(), order.end()));
    return false;
  }

  static bool isPossible(const std::vector<const Write*>& order) {
    for (auto each = order.begin(); each != order.end(); ++each)
      for (auto before = order.begin(); before != each; ++before)
        if ((*each)->ended < (*before)->started) return false;
    return true;
  }

  bool explains(const std::vector<const Write*>& order) const {
    std::vector<unsigned> asyncOuts{asyncBefore_};
    std::vector<const Write*> trains;
    for (const Write* each : order) {
      const unsigned after = each->asyncAfter(asyncOuts.back());
      if (after != asyncOuts.back()) asyncOuts.push_back(after);
      if (each->marksAnySync()) trains.push_back(each);
    }
    return asyncOuts == asyncOuts_ && plays(trains, 0, syncBefore_, 0);
  }

  // From `clock` on, with these synchronous outputs before it, the rest of the trains is played in order.
  bool plays(const std::vector<const Write*>& trains, std::size_t next, unsigned before,
             std::size_t clock) const {
    if (next == trains.size()) {
      while (clock < syncOuts_.size() && syncOuts_[clock] == before) ++clock;
      return clock == syncOuts_.size();
    }
    const Write& write = *trains[next];
    for (; clock + steps <= syncOuts_.size(); ++clock) {
      if (write.succeeded && clock + steps > write.end) return false;
      if (clock >= write.begin && playsAt(write, before, clock) &&
          plays(trains, next + 1, write.syncAt(steps - 1, before), clock + steps))
        return true;
      if (syncOuts_[clock] != before) return false;
    }
    return false;
  }

  bool playsAt(const Write& write, unsigned before, std::size_t clock) const {
    for (unsigned step = 0; step < steps; ++step)
      if (syncOuts_[clock + step] != write.syncAt(step, before)) return false;
    return true;
  }

  void settle() {
    for (const unsigned long start = core_.clocks(); core_.clocks() < start + 60;) chain_.idle(8);
  }

  using Port = FreeCore<MODEL>::Port;

  RandomScans random_;
  double rate_;
  FreeCore<MODEL> core_{random_, EDGE_CAPTURE != 0};
  PinsChain chain_{core_};
  Reader first_{{random_, chain_, payloadBits, recordBits, 0x1230}};
  Reader rival_{{random_, chain_, payloadBits, recordBits, 0x4560}};
  AttackedHost& host_ = first_.host;
  Bits status_;
  const char* wrong_ = nullptr;

  bool reads_ = false, damages_ = false;
  unsigned rivalCalls_ = 0, rivalActed_ = 0;              // that may come yet, and that have come
  Activity reported_[2], happened_[2], lastReported_[2];  // asynchronous, synchronous

  unsigned events_ = 0;
  unsigned long start_ = 0;
  std::vector<Write> writes_;
  unsigned asyncBefore_ = 0, syncBefore_ = 0;
  std::vector<unsigned> asyncOuts_, syncOuts_;
};

}  // namespace

int main(int argc, char** argv) {
  const unsigned long rounds = argc > 1 ? std::strtoul(argv[1], nullptr, 10) : 100;
  const unsigned seed = argc > 2 ? static_cast<unsigned>(std::strtoul(argv[2], nullptr, 10)) : 3;
  std::map<std::string, unsigned long> counts;
  // Clocks per TCK: from 50 times slower to 50 times faster.
  for (const double rate : {0.02, 0.13, 0.7, 1.0, 1.9, 7.0, 50.0}) {
    Attack attack(seed, rate);
    for (unsigned long i = 0; i < rounds; ++i)
      if (const char* wrong = attack.round()) {
        std::printf("round %lu at %g clocks per TCK: %s\n", i, rate, wrong);
        return 1;
      }
    for (const auto& [what, count] : attack.host().counts) counts[what] += count;
    for (const auto& [what, count] : attack.rival().counts) counts[what] += count;
  }
  std::printf("%lu rounds at each of 7 clock rates:", rounds);
  for (const auto& [what, count] : counts) std::printf(" %lu %s,", count, what.c_str());
  std::printf(" no fault\n");
  return 0;
}
