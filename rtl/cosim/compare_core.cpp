// Plays random scans and random inputs to one core in Verilog and in C++, with the widths that the build gives; every
// bit that comes out of TDO and of the output ports must be the same. Whatever the C++ core does in its design clock n,
// the other does in clock n + 2.
#include <cstdio>
#include <cstdlib>
#include <deque>

#include "SimDesign.h"
#include "rtl/cosim/LockStep.h"
#include "rtl/cosim/RandomScans.h"
#include "rtl/cosim/RtlPins.h"
#include "sim/Chain.h"
#include "sim/VioCore.h"
#include MODEL_HEADER

namespace {

using namespace qorsim;

constexpr unsigned lateness = 2;

// A pulse in the clocks while a snapshot is being taken may be reported with an earlier one of the same input, so there are
// none: the last snapshot is taken in the first clock after a scan.
constexpr unsigned clocksOfTake = 4, clocksAfterScan = 24;

// What the pins do in a clock, and what comes out of the synchronous outputs.
struct Moment {
  std::uint64_t asyncIn = 0, syncIn = 0, asyncGlitches = 0, syncGlitches = 0, syncOut = 0;
};

template <class Port>
std::uint64_t number(const Port& port) {
  std::uint64_t value = 0;
  for (std::size_t i = 0; i < port.size(); ++i) value |= std::uint64_t{port[i] != 0} << i;
  return value;
}

template <class Pins>
void set(Pins& pins, std::uint64_t value) {
  pins = static_cast<Pins>(value);
}

class Bench {
 public:
  Bench() : pins_([this](MODEL&) { ticked(); }), top_(pins_.model()), sim_(1) {
    CoreDescription core;
    core.asyncIn = ASYNC_IN;
    core.syncIn = SYNC_IN;
    core.asyncOut = ASYNC_OUT;
    core.syncOut = SYNC_OUT;
    core.major = MAJOR;
    core.minor = MINOR;
    core.design = callback([this](Ports& ports) { clock(ports); }, [this](Ports& ports) { start(ports); });
    Tap tap(0x0A5F1093, 6);
    tap.hub(1).add(0, std::make_unique<VioCore>(core));
    sim_.add(std::move(tap));
    both_.clocks(clocksAfterScan);
  }

  // False when something differs.
  bool step(bool selects) {
    mayGlitch_ = false;
    const bool same = selects ? select() : scan();
    both_.idle(random_.idleCycles());
    both_.clocks(clocksOfTake);
    mayGlitch_ = true;
    both_.clocks(clocksAfterScan);
    return same && outputsAgree_ && top_.async_out == asyncOut_;
  }

 private:
  bool select() {
    Bits ir;
    appendNumber(ir, random_.oneIn(4) ? random_.below(64) : 2, 6);
    return both_.scanIr(ir, qorrtl::pausePoint(random_, ir));
  }

  bool scan() {
    const qorrtl::RandomScan scan = random_.scan(2 * ASYNC_OUT + 17 * SYNC_OUT, 4 * ASYNC_IN + 6 * SYNC_IN);
    return both_.scanDr(scan, qorrtl::pausePoint(random_, scan.bits));
  }

  void start(Ports& ports) {
    drive(ports);
    Moment atPowerUp;
    atPowerUp.asyncIn = number(ports.asyncIn);
    atPowerUp.syncIn = number(ports.syncIn);
    late_.assign(lateness, atPowerUp);
    apply(atPowerUp);
    top_.eval();
  }

  void clock(Ports& ports) {
    if (random_.oneIn(2)) drive(ports);
    if (EDGE_CAPTURE && mayGlitch_) glitch(ports);
    asyncOut_ = number(ports.asyncOut);
    late_.push_back({number(ports.asyncIn), number(ports.syncIn), number(ports.asyncInGlitches),
                     number(ports.syncInGlitches), number(ports.syncOut)});
  }

  static void flipSome(qorrtl::RandomScans& random, const PortBits<unsigned char>& port) {
    for (unsigned char& bit : port) bit ^= random.oneIn(8);
  }

  void glitch(const Ports& ports) {
    flipSome(random_, ports.asyncInGlitches);
    flipSome(random_, ports.syncInGlitches);
  }

  // A few of the inputs change.
  void drive(const Ports& ports) {
    flipSome(random_, ports.asyncIn);
    flipSome(random_, ports.syncIn);
  }

  void ticked() {
    const Moment now = late_.front();
    late_.pop_front();
    outputsAgree_ = outputsAgree_ && top_.sync_out == now.syncOut;
    apply(now);
    top_.eval();
    if (now.asyncGlitches == 0 && now.syncGlitches == 0) return;
    Moment glitched = now;
    glitched.asyncIn ^= now.asyncGlitches;
    glitched.syncIn ^= now.syncGlitches;
    apply(glitched);
    top_.eval();
    apply(now);
    top_.eval();
  }

  void apply(const Moment& moment) {
    set(top_.async_in, moment.asyncIn);
    set(top_.sync_in, moment.syncIn);
  }

  qorrtl::RandomScans random_{2};
  std::deque<Moment> late_;
  std::uint64_t asyncOut_ = 0;
  bool outputsAgree_ = true;
  bool mayGlitch_ = false;
  qorrtl::RtlPins<MODEL> pins_;
  MODEL& top_;
  Chain sim_;
  qorrtl::LockStep<MODEL> both_{sim_, pins_};
};

}  // namespace

int main(int argc, char** argv) {
  const unsigned long scans = argc > 1 ? std::strtoul(argv[1], nullptr, 10) : 20000;
  Bench bench;
  for (unsigned long i = 0; i < scans; ++i)
    if (!bench.step(i % 32 == 0)) {
      std::printf("scan %lu, or an output after it, differs\n", i);
      return 1;
    }
  std::printf("core %d/%d/%d/%d, version %d.%d%s: %lu scans, all the same\n", ASYNC_IN, SYNC_IN, ASYNC_OUT,
              SYNC_OUT, MAJOR, MINOR, EDGE_CAPTURE ? ", edge capture" : "", scans);
  return 0;
}
