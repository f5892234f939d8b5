// One core in Verilog behind a remote_bitbang server, which can charge for each run of its client's queue.
#pragma once

#include <atomic>
#include <chrono>
#include <cstdint>
#include <string>
#include <thread>

#include "BitbangServer.h"
#include "rtl/cosim/RtlPins.h"

namespace qorrtl {

/// Counts what goes over the wires. A client that switches the light on when it runs its queue, as OpenOCD does, waits
/// `charge` then, as it would for a USB adapter.
template <class Model>
class ChargingPins : public RtlPins<Model> {
 public:
  explicit ChargingPins(std::chrono::microseconds charge) : charge_(charge) {}

  void write(bool tck, bool tms, bool tdi) override {
    if (tck && this->model().tck == 0) ++tcks;
    RtlPins<Model>::write(tck, tms, tdi);
  }
  void setLight(bool on) override {
    if (!on) return;
    ++runs;
    const auto end = std::chrono::steady_clock::now() + charge_;
    if (charge_ > spin) std::this_thread::sleep_until(end - spin);
    while (std::chrono::steady_clock::now() < end) {  // a sleep is late by half a charge
    }
  }

  std::atomic<std::uint64_t> tcks{0}, runs{0};

 private:
  static constexpr std::chrono::microseconds spin{200};

  const std::chrono::microseconds charge_;
};

/// Served as long as it lives.
template <class Model>
class ServedCore {
 public:
  explicit ServedCore(std::chrono::microseconds charge = std::chrono::microseconds(0))
      : pins(charge),
        server_(pins, 0),
        thread_([this] { server_.serve([this] { return stopped_.load(); }); }) {}
  ~ServedCore() {
    stopped_ = true;
    thread_.join();
  }
  ServedCore(const ServedCore&) = delete;
  ServedCore& operator=(const ServedCore&) = delete;

  std::string port() const { return std::to_string(server_.port()); }

  ChargingPins<Model> pins;

 private:
  std::atomic<bool> stopped_{false};
  qorsim::BitbangServer server_;
  std::thread thread_;
};

}  // namespace qorrtl
