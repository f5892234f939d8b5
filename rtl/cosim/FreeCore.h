// A core with 8 bits of every port whose design clock runs beside TCK, at any rate, while its inputs move. It notes what
// happened at its ports.
#pragma once

#include <utility>
#include <vector>

#include "Pins.h"
#include "rtl/cosim/RandomScans.h"
#include "rtl/cosim/RtlPins.h"

namespace qorrtl {

/// Of one port, a mask each.
struct Activity {
  unsigned up = 0, down = 0;
  void add(const Activity& other) {
    up |= other.up;
    down |= other.down;
  }
  bool within(const Activity& other) const { return (up & ~other.up) == 0 && (down & ~other.down) == 0; }
};

template <class Model>
class FreeCore : public qorsim::Pins {
 public:
  static constexpr unsigned width = 8;

  /// What the pins of a port did.
  struct Port {
    unsigned takeMoved() { return std::exchange(moved, 0); }
    Activity takeHappened() { return std::exchange(happened, {}); }

    unsigned moved = 0;
    Activity happened;
    unsigned long quietUntil[width] = {};  // clocks
  };

  FreeCore(RandomScans& random, bool seesGlitches) : random_(random), seesGlitches_(seesGlitches) {
    model_.tck = model_.clk = 0;
    model_.async_in = static_cast<unsigned char>(random_.below(256));  // no activity: it is so since power-up
    model_.sync_in = static_cast<unsigned char>(random_.below(256));
    model_.eval();
  }
  ~FreeCore() override { model_.final(); }

  void write(bool tck, bool tms, bool tdi) override {
    model_.tms = tms;
    model_.tdi = tdi;
    pass();
    model_.tck = tck;
    model_.eval();
    if (asyncOuts_.back() != model_.async_out) asyncOuts_.push_back(model_.async_out);
  }
  bool tdo() override { return model_.tdo != 0; }
  void setTrst(bool) override {}

  /// Clocks per TCK, on average; 0 is a stopped clock. The other does it after so many edges of TCK.
  /// @{
  void setRate(double rate) {
    rate_ = rate / 2;
    edgesToNext_ = 0;
  }
  void setRateIn(unsigned edges, double rate) {
    edgesToNext_ = edges + 1;
    next_ = rate / 2;
  }
  /// @}
  unsigned long clocks() const { return clocks_; }

  /// Inputs move as often as one in `rarity` chances, or not if that is 0.
  void setMoving(unsigned rarity) { rarity_ = rarity; }
  bool moving() const { return rarity_ != 0; }

  Port asyncIn, syncIn;
  Model& model() { return model_; }

  /// The synchronous outputs after each clock since the last call, and the values that the asynchronous ones had.
  std::vector<unsigned> takeSyncOuts() { return std::exchange(syncOuts_, {}); }
  std::vector<unsigned> takeAsyncOuts() { return std::exchange(asyncOuts_, {model_.async_out}); }

 private:
  void pass() {
    if (edgesToNext_ != 0 && --edgesToNext_ == 0) rate_ = next_;
    for (due_ += rate_ * random_.below(1024) / 512; due_ >= 1; due_ -= 1) tick();
    if (rarity_ != 0 && random_.oneIn(4)) move(model_.async_in, asyncIn, seesGlitches_ ? 0 : 2);
  }

  void tick() {
    ++clocks_;
    qorrtl::tick(model_, [this] {
      syncOuts_.push_back(model_.sync_out);
      if (rarity_ != 0) move(model_.sync_in, syncIn, 0);
      model_.eval();
    });
  }

  // One input changes, and stays for so many clocks.
  template <class Pins>
  void move(Pins& pins, Port& port, unsigned stays) {
    if (!random_.oneIn(rarity_)) return;
    const unsigned place = random_.below(width), bit = 1u << place;
    if (port.quietUntil[place] > clocks_) return;
    port.quietUntil[place] = clocks_ + stays;
    pins = static_cast<Pins>(pins ^ bit);
    model_.eval();
    port.moved |= bit;
    ((pins & bit) != 0 ? port.happened.up : port.happened.down) |= bit;
  }

  RandomScans& random_;
  bool seesGlitches_;
  Model model_;
  double rate_ = 1, next_ = 1, due_ = 0;
  unsigned edgesToNext_ = 0;
  unsigned rarity_ = 0;
  unsigned long clocks_ = 0;
  std::vector<unsigned> syncOuts_, asyncOuts_{0};
};

}  // namespace qorrtl
