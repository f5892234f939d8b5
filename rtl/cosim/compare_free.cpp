// A core whose design clock runs freely beside TCK, slower or faster, while inputs move: every activity is told and none
// is invented, though answers get lost; and every pulse train plays once and whole. 8 bits of every port.
#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <functional>

#include "rtl/cosim/PinsChain.h"
#include "rtl/cosim/RandomScans.h"
#include "rtl/cosim/RtlPins.h"
#include MODEL_HEADER

namespace {

using namespace qorsim;

constexpr unsigned width = 8, steps = 16, payloadBits = 19 * width, recordBits = 10 * width;
constexpr unsigned headBits = 16, crcBits = 16, troubleFlags = 0xF;

// Of one port, a mask each.
struct Activity {
  unsigned up = 0, down = 0;
  bool operator==(const Activity& other) const { return up == other.up && down == other.down; }
};

/// The wires of a core whose design clock is somebody else's: `passed` is called before each edge of TCK.
class FreePins : public Pins {
 public:
  FreePins(MODEL& model, std::function<void()> passed) : model_(model), passed_(std::move(passed)) {
    model_.tck = model_.clk = 0;
    model_.eval();
  }

  void write(bool tck, bool tms, bool tdi) override {
    model_.tms = tms;
    model_.tdi = tdi;
    passed_();
    model_.tck = tck;
    model_.eval();
  }
  bool tdo() override { return model_.tdo != 0; }
  void setTrst(bool) override {}

 private:
  MODEL& model_;
  std::function<void()> passed_;
};

class Host {
 public:
  explicit Host(unsigned ticksPer16Edges)
      : rate_(ticksPer16Edges), pins_(top_, [this] { passed(); }), rtl_(pins_) {
    Bits ir;
    appendNumber(ir, 2, 6);
    rtl_.scanIr(ir, 0);
    rtl_.idle(200);
  }

  // Moves inputs during some reads, then reads until nothing can be under way: the flags of all that must be the
  // activity that there was.
  bool readRound() {
    toldAsync_ = toldSync_ = happenedAsync_ = happenedSync_ = {};
    moving_ = true;
    rarity_ = 4u << 2 * random_.below(4);
    for (unsigned i = 1 + random_.below(4); i > 0; --i) read();
    moving_ = false;
    rtl_.idle(settleCycles());
    read();
    return toldAsync_ == happenedAsync_ && toldSync_ == happenedSync_ && lastAsync_ == top_.async_in &&
           lastSync_ == top_.sync_in;
  }

  // Writes random trains: from some clock on, the written outputs play them, and the others go on.
  bool writeRound() {
    const Bits payload = random_.bits(payloadBits);
    const unsigned before = top_.sync_out;
    played_.clear();
    send(0x2, payload, 0);
    rtl_.idle(settleCycles());
    if ((numberAt(send(0xF, {}, headBits).data(), headBits) & troubleFlags) != 0) return false;
    for (std::size_t start = 0; start + steps < played_.size(); ++start)
      if (plays(payload, before, start)) return true;
    return false;
  }

 private:
  void passed() {
    for (due_ += random_.below(2 * rate_ + 1); due_ >= 16; due_ -= 16) {
      qorrtl::tick(top_, [this] {
        played_.push_back(top_.sync_out);
        if (moving_) move(top_.sync_in, happenedSync_);
      });
    }
    if (moving_ && random_.oneIn(4)) move(top_.async_in, happenedAsync_);
  }

  // One input changes, and stays for a while unless edges are captured.
  void move(CData& pins, Activity& activity) {
    if (!random_.oneIn(rarity_)) return;
    const unsigned bit = 1u << random_.below(width);
    if (!EDGE_CAPTURE && &pins == &top_.async_in && (moved_ & bit) != 0) return;
    moved_ |= bit;
    pins = static_cast<CData>(pins ^ bit);
    top_.eval();
    ((pins & bit) != 0 ? activity.up : activity.down) |= bit;
  }

  // Takes as many tries as it needs; answers that hold are sometimes taken for lost.
  void read() {
    moved_ = 0;
    unsigned cycles = 8;
    for (unsigned code = 0x3;; code = 0x5, cycles *= 2) {
      send(code, {}, 0);
      rtl_.idle(cycles);
      const Bits answer = send(0x4, {}, headBits + recordBits + crcBits);
      if ((numberAt(answer.data(), headBits) & troubleFlags) != 0) continue;
      if (numberAt(answer.data() + headBits + recordBits, crcBits) !=
          checksum(answer.data(), headBits + recordBits, recordBits))
        std::exit(1);
      if (random_.oneIn(4)) continue;
      take(answer);
      return;
    }
  }

  void take(const Bits& answer) {
    const unsigned char* digit = answer.data() + headBits + recordBits;
    lastAsync_ = lastSync_ = 0;
    for (unsigned i = 0; i < width; ++i, digit -= 4) note(digit, i, lastAsync_, toldAsync_);
    for (unsigned i = 0; i < width; ++i, digit -= 6) note(digit, i, lastSync_, toldSync_);
  }

  static void note(const unsigned char* end, unsigned input, unsigned& values, Activity& told) {
    values |= unsigned{end[-1]} << input;
    told.up |= unsigned{end[-2]} << input;
    told.down |= unsigned{end[-3]} << input;
  }

  // A frame, filled up to `length`; returns what came out.
  Bits send(unsigned code, const Bits& payload, std::size_t length) {
    Bits message = payload;
    appendNumber(message, code << 4, 8);
    appendNumber(message, checksum(message.data(), message.size(), payload.size()), 16);
    Bits scan(std::max(length, message.size() + 2) - message.size() - 1, 1);
    scan.push_back(0);
    scan.insert(scan.end(), message.begin(), message.end());
    rtl_.scanDr(scan, 0);
    return scan;
  }

  bool plays(const Bits& payload, unsigned before, std::size_t start) const {
    for (std::size_t clock = 0; clock < played_.size(); ++clock) {
      for (unsigned i = 0; i < width; ++i) {
        const auto digit = [&](std::size_t at) { return unsigned{payload[payloadBits - 1 - at]}; };
        const bool written = clock >= start && digit(payloadBits - width + i) != 0;
        const std::size_t step = std::min<std::size_t>(clock - start, steps - 1);
        const unsigned expected = written ? digit(width + steps * i + step) : before >> i & 1;
        if ((played_[clock] >> i & 1) != expected) return false;
      }
    }
    return true;
  }

  // TCKs in which there are forty design clocks for certain, or nearly.
  unsigned settleCycles() const { return 40 * 16 / rate_ + 40; }

  unsigned rate_;
  unsigned due_ = 0;  // sixteenths of a tick
  qorrtl::RandomScans random_{3};
  bool moving_ = false;
  unsigned rarity_ = 4;  // of moves: often, so that flags meet, or rarely, so that each counts
  unsigned moved_ = 0;   // asynchronous inputs, during this read
  Activity happenedAsync_, happenedSync_, toldAsync_, toldSync_;
  unsigned lastAsync_ = 0, lastSync_ = 0;
  std::vector<unsigned> played_;
  MODEL top_;
  FreePins pins_;
  qorrtl::PinsChain rtl_;
};

}  // namespace

int main(int argc, char** argv) {
  const unsigned long rounds = argc > 1 ? std::strtoul(argv[1], nullptr, 10) : 500;
  for (const unsigned rate : {1, 2, 5, 8, 16, 40}) {
    Host host(rate);
    for (unsigned long i = 0; i < rounds; ++i) {
      if (host.readRound() && host.writeRound()) continue;
      std::printf("round %lu at %u clocks in 8 TCKs goes wrong\n", i, rate);
      return 1;
    }
  }
  std::printf("free design clock%s: %lu rounds at each of 6 rates, all told, all played\n",
              EDGE_CAPTURE ? ", edge capture" : "", rounds);
  return 0;
}
