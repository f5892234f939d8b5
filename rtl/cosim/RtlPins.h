// The wires of a board that Verilator has made of its Verilog.
#pragma once

#include <functional>
#include <utility>

#include "Pins.h"

namespace qorrtl {

/// A whole period of the design clock, with something to do after its rising edge.
template <class Model, class Action>
void tick(Model& model, Action afterEdge) {
  model.clk = 1;
  model.eval();
  afterEdge();
  model.clk = 0;
  model.eval();
}

/// `Model` has the ports tck, tms, tdi, tdo and clk. Its design clock ticks once after every rising edge of TCK, until
/// it is stopped.
template <class Model>
class RtlPins : public qorsim::Pins {
 public:
  /// `afterEdge`, unless it is empty, is called after each rising edge of the design clock, and may change the
  /// model's other inputs.
  explicit RtlPins(std::function<void(Model&)> afterEdge = {}) : afterEdge_(std::move(afterEdge)) {
    write(false, true, true);
  }
  ~RtlPins() override { model_.final(); }

  Model& model() { return model_; }

  void write(bool tck, bool tms, bool tdi) override {
    const bool rises = tck && model_.tck == 0;
    model_.tms = tms;
    model_.tdi = tdi;
    model_.tck = tck;
    model_.eval();
    if (rises && ticks_) tickOnce();
  }

  void stopClock() { ticks_ = false; }
  void tickOnce() {
    tick(model_, [this] {
      if (!afterEdge_) return;
      afterEdge_(model_);
      model_.eval();
    });
  }

  bool tdo() override { return model_.tdo != 0; }

  /// The boards have no TRST: five TCKs with TMS high do the same.
  void setTrst(bool asserted) override {
    for (int i = 0; asserted && i < 5; ++i) {
      write(false, true, true);
      write(true, true, true);
    }
    write(false, true, true);
  }

 private:
  Model model_;
  std::function<void(Model&)> afterEdge_;
  bool ticks_ = true;
};

}  // namespace qorrtl
