// What a poll of all inputs takes through each cable, beside the same scans sent by a Tcl loop inside OpenOCD and by
// nobody but the Verilog: all in one run, by turns.
#include <benchmark/benchmark.h>

#include <atomic>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "BitbangServer.h"
#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "Sim.h"
#include "Vwire256.h"
#include "Vwire4096.h"
#include "Vwire64.h"
#include "Vwire8.h"
#include "board/session/CountingCable.h"
#include "platform/jtag/cable/openocd/OpenOcdServer.h"
#include "platform/jtag/cable/openocd/OpenOcdText.h"
#include "rtl/cosim/PinsCable.h"
#include "rtl/cosim/RtlPins.h"

namespace {

using QorRT::Qor_Device;

constexpr QOR_CORE_REF core{0, 1, 0};
const std::vector<Qor_Device> chainDevices{{0x0A5F1093, "fpga", 6}};

/// One core in Verilog behind a server, as long as it lives.
template <class Model>
class ServedCore {
 public:
  ServedCore() : server_(pins_, 0), thread_([this] { server_.serve([this] { return stopped_.load(); }); }) {}
  ~ServedCore() {
    stopped_ = true;
    thread_.join();
  }
  ServedCore(const ServedCore&) = delete;
  ServedCore& operator=(const ServedCore&) = delete;

  std::string port() const { return std::to_string(server_.port()); }

 private:
  qorrtl::RtlPins<Model> pins_;
  std::atomic<bool> stopped_{false};
  qorsim::BitbangServer server_;
  std::thread thread_;
};

/// A session that reads all inputs of one core.
class Poller {
 public:
  Poller(std::unique_ptr<QorRT::Qor_Cable> cable, unsigned width)
      : session_(QorJtag_session_openCable(std::make_unique<qor::CountingCable>(std::move(cable), traffic_))),
        width_(width),
        ports_(8, std::vector<unsigned char>((width + 7) / 8)) {
    require(QorVIO_initCore(session_, core));
    poll();
    traffic_ = {};
  }
  ~Poller() { QorJtag_session_close(session_); }
  Poller(const Poller&) = delete;
  Poller& operator=(const Poller&) = delete;

  void poll() {
    ++polls_;
    require(QorVIO_getPortBits(session_, core, ports_[0].data(), ports_[1].data(), ports_[2].data(), width_,
                               ports_[3].data(), ports_[4].data(), ports_[5].data(), ports_[6].data(),
                               ports_[7].data(), width_));
  }

  double exchangesAPoll() const { return static_cast<double>(traffic_.exchanges) / (polls_ - 1); }
  double scansAPoll() const { return static_cast<double>(traffic_.scans) / (polls_ - 1); }

 private:
  static void require(unsigned code) {
    if (code != 0) throw std::runtime_error("a call of the library failed");
  }

  qor::Traffic traffic_;
  unsigned session_;
  unsigned width_;
  std::vector<std::vector<unsigned char>> ports_;
  unsigned polls_ = 0;
};

/// The cable to the Verilog in process, which keeps the last queue to play it again.
class KeepingCable : public qorrtl::PinsCable {
 public:
  KeepingCable(qorsim::Pins& pins, std::vector<QorRT::Qor_Scan>& kept)
      : PinsCable(chainDevices, pins), kept_(kept) {}

 private:
  void run(std::vector<QorRT::Qor_Scan>& scans) override {
    kept_ = scans;
    PinsCable::run(scans);
  }
  std::vector<QorRT::Qor_Scan>& kept_;
};

/// The scans of a queue as somebody would write them into a Tcl loop, which OpenOCD runs by itself.
class TclLoop {
 public:
  TclLoop(QorRT::TcpStream& server, const std::vector<QorRT::Qor_Scan>& scans) : server_(server) {
    std::string body = "set r {}\n";
    for (const QorRT::Qor_Scan& scan : scans)
      QorRT::appendStep(body, {{"fpga.tap", 0, {}, 6}}, {{chainDevices[0]}}, scan);
    ask("proc poll_loop {n} {for {set i 0} {$i < $n} {incr i} {" + body + "}; set r}");
  }

  void run(unsigned polls) {
    if (ask("poll_loop " + std::to_string(polls)).empty()) throw std::runtime_error("the Tcl loop failed");
  }

 private:
  std::string ask(const std::string& command) {
    return server_.ask(command + '\x1A', '\x1A', QorRT::TcpStream::Seconds(120));
  }

  QorRT::TcpStream& server_;
};

enum Way { sim, verilog, bitbang, openOcd, tcl, wayCount };
constexpr const char* wayNames[] = {"sim", "verilog", "rbb", "openocd", "tcl"};

template <class Action>
double secondsOf(Action action) {
  const auto begin = std::chrono::steady_clock::now();
  action();
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - begin).count();
}

std::unique_ptr<QorRT::Qor_Cable> simulated(unsigned width) {
  return qorsim::chain()
      .device(0x0A5F1093)
      .core(1, 0, qorsim::vio().asyncIn(width).syncIn(width).asyncOut(width).syncOut(width))
      .cable();
}

/// The ways by turns, so many polls each; the counters are seconds.
template <class Model>
void polls(benchmark::State& state) {
  const auto width = static_cast<unsigned>(state.range(0));
  const unsigned turn = 2 + 400 / width;
  std::vector<QorRT::Qor_Scan> queue;
  qorrtl::RtlPins<Model> pins, pinsAlone;
  Poller simPoller(simulated(width), width);
  Poller(std::make_unique<KeepingCable>(pins, queue), width);
  qorrtl::PinsCable alone(chainDevices, pinsAlone);

  ServedCore<Model> first, second;
  Poller bitbangPoller(QorRT::openCable(("rbb:127.0.0.1:" + first.port()).c_str()), width);
  setenv("QORVIO_BOARD_PORT", second.port().c_str(), 1);
  QorRT::OpenOcdServer server(QORVIO_SOURCE_DIR "/rtl/cosim/openocd-core.cfg");
  const auto stream = server.connect(QorRT::TcpStream::Seconds(10));
  Poller openOcdPoller(QorRT::openCable(("openocd:127.0.0.1:" + server.tclPort()).c_str()), width);
  TclLoop loop(*stream, queue);

  double seconds[wayCount] = {};
  const auto polling = [turn](Poller& poller) {
    return secondsOf([&] {
      for (unsigned i = 0; i < turn; ++i) poller.poll();
    });
  };
  for (auto _ : state) {
    seconds[sim] += polling(simPoller);
    seconds[bitbang] += polling(bitbangPoller);
    seconds[openOcd] += polling(openOcdPoller);
    seconds[tcl] += secondsOf([&] { loop.run(turn); });
    seconds[verilog] += secondsOf([&] {
      for (unsigned i = 0; i < turn; ++i) {
        for (const QorRT::Qor_Scan& scan : queue) {
          if (scan.kind == QorRT::Qor_Scan::Kind::ir) alone.scanIr(0, scan.userChain);
          if (scan.kind == QorRT::Qor_Scan::Kind::dr) alone.scanDr(0, scan.out, scan.bitCount, scan.capture);
          if (scan.kind == QorRT::Qor_Scan::Kind::idle) alone.idle(scan.cycles);
        }
        alone.flush();
      }
    });
  }
  const double count = static_cast<double>(state.iterations()) * turn;
  for (int way = 0; way < wayCount; ++way) state.counters[wayNames[way]] = seconds[way] / count;
  state.counters["exchanges"] = openOcdPoller.exchangesAPoll();
  state.counters["scans"] = openOcdPoller.scansAPoll();
}

/// After the lines of Google Benchmark, the table that they are for.
class WireReporter : public benchmark::ConsoleReporter {
 public:
  WireReporter() : ConsoleReporter(OO_Tabular) {}

  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs)
      if (run.run_type == Run::RT_Iteration && !run.error_occurred) addLines(run);
  }

  void Finalize() override {
    std::printf(
        "\nPolls of all inputs. Ratios of speed: to the same scans in a Tcl loop inside OpenOCD, and to the "
        "Verilog "
        "alone\n%9s %9s %10s %10s %10s %8s %9s\n%s",
        "port bits", "way", "polls/s", "us/scan", "exchanges", "of tcl", "of verilog", table_.c_str());
  }

 private:
  void addLines(const Run& run) {
    const auto value = [&](const char* name) { return run.counters.at(name).value; };
    for (const char* way : wayNames) {
      const bool counted = std::string(way) != "verilog" && std::string(way) != "tcl";
      char line[120];
      std::snprintf(line, sizeof line, "%9s %9s %10.1f %10.1f %10s %8.2f %9.2f\n",
                    ("4 x " + run.run_name.args).c_str(), way, 1 / value(way),
                    1e6 * value(way) / value("scans"),
                    counted ? std::to_string(value("exchanges")).substr(0, 4).c_str() : "-",
                    value("tcl") / value(way), value("verilog") / value(way));
      table_ += line;
    }
  }

  std::string table_;
};

#define QOR_POLLS(width) \
  BENCHMARK_TEMPLATE(polls, Vwire##width)->Arg(width)->Unit(benchmark::kMillisecond)->UseRealTime()
QOR_POLLS(8);
QOR_POLLS(64);
QOR_POLLS(256);
QOR_POLLS(4096);

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  WireReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  return 0;
}
