#include "SimDesign.h"

#include <algorithm>
#include <cstdint>
#include <utility>

namespace qorsim {
namespace {

using Inputs = PortBits<unsigned char>;
using Outputs = PortBits<const unsigned char>;

class Loopback : public Design {
 public:
  void clock(Ports& ports) override {
    follow(ports.asyncIn, ports.asyncOut);
    follow(ports.syncIn, ports.syncOut);
  }

 private:
  static void follow(Inputs in, Outputs out) {
    std::copy_n(out.begin(), std::min(in.size(), out.size()), in.begin());
  }
};

class Counter : public Design {
 public:
  void clock(Ports& ports) override {
    ++count_;
    show(ports.asyncIn);
    show(ports.syncIn);
  }

 private:
  void show(Inputs in) const {
    for (std::size_t i = 0; i < std::min<std::size_t>(in.size(), 64); ++i) in[i] = count_ >> i & 1;
  }

  std::uint64_t count_ = 0;
};

class Toggle : public Design {
 public:
  void clock(Ports& ports) override {
    for (unsigned char& bit : ports.asyncIn) bit ^= 1;
    for (unsigned char& bit : ports.syncIn) bit ^= 1;
  }
};

class Idle : public Design {
 public:
  void clock(Ports&) override {}
};

class Callback : public Design {
 public:
  Callback(std::function<void(Ports&)> clock, std::function<void(Ports&)> start)
      : clock_(std::move(clock)), start_(std::move(start)) {}

  void start(Ports& ports) override {
    if (start_) start_(ports);
  }
  void clock(Ports& ports) override { clock_(ports); }

 private:
  std::function<void(Ports&)> clock_;
  std::function<void(Ports&)> start_;
};

}  // namespace

Design::~Design() = default;

void Design::start(Ports&) {}

std::shared_ptr<Design> loopback() {
  return std::make_shared<Loopback>();
}

std::shared_ptr<Design> counter() {
  return std::make_shared<Counter>();
}

std::shared_ptr<Design> toggle() {
  return std::make_shared<Toggle>();
}

std::shared_ptr<Design> idle() {
  return std::make_shared<Idle>();
}

std::shared_ptr<Design> callback(std::function<void(Ports&)> clock, std::function<void(Ports&)> start) {
  return std::make_shared<Callback>(std::move(clock), std::move(start));
}

}  // namespace qorsim
