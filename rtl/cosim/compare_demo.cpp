// Plays random scans to the demo board in Verilog and in C++; every bit that comes out must be the same.
#include <cstdio>
#include <cstdlib>

#include "SimDesign.h"
#include "Vqor_demo_top.h"
#include "rtl/cosim/LockStep.h"
#include "rtl/cosim/RandomScans.h"
#include "rtl/cosim/RtlPins.h"
#include "sim/Chain.h"
#include "sim/StatusWord.h"
#include "sim/VioCore.h"

namespace {

using namespace qorsim;

// Spelled out here, not taken from the builder of the simulated board: it must be this very board.
void build(Chain& chain) {
  CoreDescription looped, other, counting;
  looped.asyncIn = looped.syncIn = looped.asyncOut = looped.syncOut = 8;
  looped.design = loopback();
  other.type = 7;
  counting.major = 6;
  counting.minor = 1;
  counting.asyncIn = counting.syncIn = 16;
  counting.asyncOut = counting.syncOut = 4;
  counting.design = counter();
  Tap fpga(0x0A5F1093, 6), cpld(0x1234567B, 8);
  fpga.hub(1).add(0, std::make_unique<VioCore>(looped));
  fpga.hub(1).add(1, std::make_unique<Core>(statusWord(other)));
  cpld.hub(1).add(0, std::make_unique<VioCore>(counting));
  chain.add(std::move(fpga));
  chain.add(std::move(cpld));
}

// One device on its user chain 1, the other in BYPASS; or any instructions.
Bits instructions(qorrtl::RandomScans& random, unsigned& device) {
  if (random.oneIn(8)) return random.bits(random.oneIn(4) ? 1 + random.below(30) : 14);
  device = random.below(2);
  Bits ir;
  appendNumber(ir, device == 0 ? 2 : 0x3F, 6);
  appendNumber(ir, device == 1 ? 2 : random.oneIn(8) ? 1 : 0xFF, 8);
  return ir;
}

}  // namespace

int main(int argc, char** argv) {
  const unsigned long scans = argc > 1 ? std::strtoul(argv[1], nullptr, 10) : 20000;
  constexpr unsigned payloadBits[] = {2 * 8 + 17 * 8, 2 * 4 + 17 * 4}, recordBits[] = {10 * 8, 10 * 16};
  Chain sim(1);
  build(sim);
  qorrtl::RtlPins<Vqor_demo_top> pins;
  qorrtl::LockStep both(sim, pins);
  qorrtl::RandomScans random(1);
  unsigned device = 0;
  both.clocks(8);
  for (unsigned long i = 0; i < scans; ++i) {
    bool same = true;
    if (i == 0 || random.oneIn(6)) {
      const Bits ir = instructions(random, device);
      same = both.scanIr(ir, qorrtl::pausePoint(random, ir));
    } else {
      const qorrtl::RandomScan scan = random.scan(payloadBits[device], recordBits[device]);
      same = both.scanDr(scan, qorrtl::pausePoint(random, scan.bits));
    }
    if (!same) {
      std::printf("scan %lu differs\n", i);
      return 1;
    }
    both.idle(random.idleCycles());
    both.clocks(24);
  }
  std::printf("demo board: %lu scans, all the same\n", scans);
  return 0;
}
