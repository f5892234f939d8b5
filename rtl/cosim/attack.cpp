// Attacks a core whose design clock runs beside TCK, or stops, while its inputs move, its wires damage what passes and
// other software scans. Always: no wrong value is taken for a right one, no output has a value that nobody wrote, no
// activity is lost or invented, each pulse train is played once for a call that succeeds and at most once for one that
// fails.
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

class Attack {
 public:
  Attack(unsigned seed, double rate) : random_(seed), rate_(rate) {
    core_.setRate(rate);
    host_.between = [this] { chain_.idle(random_.below(100)); };
    chain_.idle(200);
    host_.synchronise();
    const std::optional<Answer> status = host_.status();
    if (status) status_ = status->data;
  }

  const char* round() {
    host_.setDamage(random_.oneIn(2) ? 1 + random_.below(8) : 0);
    if (const char* wrong = readRound()) return wrong;
    return writeRound();
  }

  AttackedHost& host() { return host_; }

 private:
  // Moves inputs during some reads, then reads until nothing can be under way.
  const char* readRound() {
    for (unsigned port = 0; port < 2; ++port) told_[port] = happened_[port] = {};
    core_.setMoving(4u << 2 * random_.below(4));
    for (unsigned i = 1 + random_.below(4); i > 0; --i) {
      if (const char* wrong = read()) return wrong;
      chain_.idle(random_.below(50));
    }
    core_.setMoving(0);
    settle();
    host_.setDamage(0);
    if (const char* wrong = read()) return wrong;
    if (failed_) return "a read fails on good wires";
    for (unsigned port = 0; port < 2; ++port)
      if (!happened_[port].within(told_[port])) return "activity is lost";
    return nullptr;
  }

  const char* read() {
    const bool stops = random_.oneIn(8) && core_.moving();
    if (stops) core_.setRateIn(random_.below(300), 0);
    const std::optional<Answer> answer = host_.read();
    if (stops && !stoppedStatusAnswers()) return "no status from a stopped clock";
    core_.setRate(rate_);
    failed_ = !answer;
    std::size_t end = recordBits;
    const char* wrong = nullptr;
    Port* const ports[] = {&core_.asyncIn, &core_.syncIn};
    for (unsigned port = 0; port < 2; ++port) {
      const unsigned moved = ports[port]->takeMoved();
      const Activity during = ports[port]->takeHappened();
      if (answer) {
        const char* fault = judge(*answer, port, end, moved | movedBefore_[port], during);
        if (fault != nullptr) wrong = fault;
      }
      if (answer) window_[port] = {};
      window_[port].add(during);
      happened_[port].add(during);
      movedBefore_[port] = moved;
    }
    return wrong;
  }

  const char* judge(const Answer& answer, unsigned port, std::size_t& end, unsigned moved,
                    const Activity& during) {
    const unsigned pins = port == 0 ? core_.model().async_in : core_.model().sync_in;
    unsigned values = 0;
    Activity told;
    for (unsigned i = 0; i < width; ++i, end -= port == 0 ? 4 : 6) {
      values |= unsigned{answer.data[end - 1]} << i;
      told.up |= unsigned{answer.data[end - 2]} << i;
      told.down |= unsigned{answer.data[end - 3]} << i;
    }
    Activity allowed = window_[port];
    allowed.add(during);
    if ((answer.flags & Answer::overlap) != 0) allowed.add(lastTold_[port]);
    lastTold_[port] = told;
    told_[port].add(told);
    if (((values ^ pins) & ~moved) != 0) return "a value is wrong";
    return told.within(allowed) ? nullptr : "activity is invented";
  }

  bool stoppedStatusAnswers() {
    core_.setRate(0);
    host_.setDamage(0);
    const std::optional<Answer> status = host_.status();
    return status && status->data == status_;
  }

  // Some writes, of which none waits for the one before it, and what they must have done.
  const char* writeRound() {
    host_.setDamage(random_.oneIn(2) ? 1 + random_.below(8) : 0);
    settle();
    core_.takeSyncOuts();
    asyncBefore_ = core_.takeAsyncOuts().back();
    syncBefore_ = core_.model().sync_out;
    writes_.clear();
    const unsigned long start = core_.clocks();
    for (unsigned i = 1 + random_.below(3); i > 0; --i) {
      Write write{random_.bits(payloadBits), false, core_.clocks() - start, 0};
      if (random_.oneIn(4)) std::fill_n(write.payload.begin(), width, static_cast<unsigned char>(0));
      if (random_.oneIn(6)) core_.setRateIn(random_.below(800), random_.oneIn(2) ? 0 : rate_);
      write.succeeded = host_.write(write.payload);
      write.end = core_.clocks() - start;
      writes_.push_back(write);
    }
    core_.setRate(rate_);
    settle();
    asyncOuts_ = core_.takeAsyncOuts();
    syncOuts_ = core_.takeSyncOuts();
    for (unsigned obeyed = 0; obeyed < 1u << writes_.size(); ++obeyed)
      if (explains(obeyed)) return resynchronised();
    return "outputs are wrong";
  }

  // After eight failed writes in a row a host takes another tag; this one makes sure of its own.
  const char* resynchronised() {
    host_.setDamage(0);
    return host_.synchronise() ? nullptr : "no write goes through on good wires";
  }

  bool explains(unsigned obeyed) const {
    std::vector<unsigned> asyncOuts{asyncBefore_};
    std::vector<const Write*> trains;
    for (std::size_t i = 0; i < writes_.size(); ++i) {
      if ((obeyed >> i & 1) == 0) {
        if (writes_[i].succeeded) return false;
        continue;
      }
      const unsigned after = writes_[i].asyncAfter(asyncOuts.back());
      if (after != asyncOuts.back()) asyncOuts.push_back(after);
      if (writes_[i].marksAnySync()) trains.push_back(&writes_[i]);
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
  AttackedHost host_{random_, chain_, payloadBits, recordBits};
  Bits status_;

  bool failed_ = false;
  Activity told_[2], happened_[2], lastTold_[2];  // asynchronous, synchronous
  Activity window_[2];                            // since the last read that succeeded began
  unsigned movedBefore_[2] = {};

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
  }
  std::printf("%lu rounds at each of 7 clock rates:", rounds);
  for (const auto& [what, count] : counts) std::printf(" %lu %s,", count, what.c_str());
  std::printf(" no fault\n");
  return 0;
}
