// What polls and writes take through each cable: beside the same scans sent by a Tcl loop inside OpenOCD and by nobody
// but the Verilog, all in one run, by turns; and with a charge for each run of OpenOCD's queue, as USB adapters have it.
#include <benchmark/benchmark.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "QorJtag_Host.h"
#include "QorVIO.h"
#include "Sim.h"
#include "Vwire256.h"
#include "Vwire32.h"
#include "Vwire4096.h"
#include "Vwire64.h"
#include "Vwire8.h"
#include "board/session/CountingCable.h"
#include "platform/jtag/cable/openocd/OpenOcdText.h"
#include "platform/jtag/cable/wire/Stream.h"
#include "rtl/cosim/PinsCable.h"
#include "rtl/cosim/ServedCore.h"

namespace {

using QorRT::Deadline;
using QorRT::Qor_Device;
using QorRT::Seconds;
using qorrtl::ServedCore;

constexpr QOR_CORE_REF core{0, 1, 0};
const std::vector<Qor_Device> chainDevices{{0x0A5F1093, "fpga", 6}};
const std::string config = QORVIO_SOURCE_DIR "/rtl/cosim/openocd-core.cfg";

/// A session on one core with `asyncWidth` asynchronous and `syncWidth` synchronous inputs, and as many outputs.
class Client {
 public:
  Client(std::unique_ptr<QorRT::Qor_Cable> cable, unsigned asyncWidth, unsigned syncWidth)
      : session_(QorJtag_session_openCable(std::make_unique<qor::CountingCable>(std::move(cable), traffic))),
        asyncWidth_(asyncWidth),
        syncWidth_(syncWidth),
        ports_(8, std::vector<unsigned char>((std::max(asyncWidth, syncWidth) + 7) / 8, 0xFF)) {
    require(QorVIO_initCore(session_, core));
    write();
    poll();
    traffic = {};
  }
  ~Client() { QorJtag_session_close(session_); }
  Client(const Client&) = delete;
  Client& operator=(const Client&) = delete;

  void poll() {
    require(QorVIO_getPortBits(session_, core, ports_[0].data(), ports_[1].data(), ports_[2].data(),
                               asyncWidth_, ports_[3].data(), ports_[4].data(), ports_[5].data(),
                               ports_[6].data(), ports_[7].data(), syncWidth_));
  }

  // Other values each time, as a host has them.
  void write() {
    const std::vector<unsigned char> all(ports_[0].size(), 0xFF), values(ports_[0].size(), ++value_);
    require(QorVIO_setPortBits(session_, core, values.data(), all.data(), asyncWidth_, nullptr, nullptr, 0));
  }

  qor::Traffic traffic;

 private:
  static void require(unsigned code) {
    if (code != 0) throw std::runtime_error("a call of the library failed");
  }

  unsigned session_;
  unsigned asyncWidth_, syncWidth_;
  unsigned char value_ = 0;
  std::vector<std::vector<unsigned char>> ports_;
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

/// An OpenOCD server that others may use too, at a port of its own.
class SharedServer {
 public:
  explicit SharedServer(const std::string& boardPort) {
    setenv("QORVIO_BOARD_PORT", boardPort.c_str(), 1);
    const std::string ports = "bindto 127.0.0.1; telnet_port disabled; gdb_port disabled; tcl_port " + port_;
    process_ = fork();
    if (process_ == 0) {
      execlp("openocd", "openocd", "-l", "/dev/null", "-c", ports.c_str(), "-f", config.c_str(), nullptr);
      _exit(127);
    }
  }
  ~SharedServer() {
    kill(process_, SIGTERM);
    waitpid(process_, nullptr, 0);
  }
  SharedServer(const SharedServer&) = delete;
  SharedServer& operator=(const SharedServer&) = delete;

  /// Another connection, as soon as there can be one.
  std::unique_ptr<QorRT::Stream> connect() const {
    for (const Deadline deadline(Seconds(10));; std::this_thread::sleep_for(std::chrono::milliseconds(20))) {
      try {
        return std::make_unique<QorRT::Stream>(QorRT::Endpoint{"127.0.0.1", port_}, deadline, nullptr);
      } catch (const std::runtime_error&) {
        if (Deadline::Clock::now() > deadline.end) throw;
      }
    }
  }
  std::string url() const { return "openocd:127.0.0.1:" + port_; }

 private:
  static std::string freePort() {
    const auto unused = qorsim::demoBoard().pins();
    return std::to_string(qorsim::BitbangServer(*unused, 0).port());
  }

  const std::string port_ = freePort();
  pid_t process_ = -1;
};

/// The scans of a queue as somebody would write them into a Tcl loop, which OpenOCD runs by itself.
class TclLoop {
 public:
  TclLoop(QorRT::Stream& server, const std::vector<QorRT::Qor_Scan>& scans) : server_(server) {
    std::string body;
    for (const QorRT::Qor_Scan& scan : scans)
      body += "set r [" + QorRT::stepCommand({{"fpga.tap", 0, {}, 6}}, {{chainDevices[0]}}, scan) + "]\n";
    ask("proc poll_loop {n} {for {set i 0} {$i < $n} {incr i} {" + body + "}; set r}");
  }

  void run(unsigned polls) {
    if (ask("poll_loop " + std::to_string(polls)).empty()) throw std::runtime_error("the Tcl loop failed");
  }

 private:
  std::string ask(const std::string& command) {
    return server_.ask(command + '\x1A', '\x1A', 1 << 20, Deadline(Seconds(120)));
  }

  QorRT::Stream& server_;
};

template <class Action>
double secondsOf(unsigned times, Action action) {
  const auto begin = std::chrono::steady_clock::now();
  for (unsigned i = 0; i < times; ++i) action();
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - begin).count();
}

std::unique_ptr<QorRT::Qor_Cable> simulated(unsigned width) {
  return qorsim::chain()
      .device(0x0A5F1093)
      .core(1, 0, qorsim::vio().asyncIn(width).syncIn(width).asyncOut(width).syncOut(width))
      .cable();
}

std::unique_ptr<QorRT::Qor_Cable> ownServer(const std::string& boardPort) {
  setenv("QORVIO_BOARD_PORT", boardPort.c_str(), 1);
  return QorRT::openCable(("openocd:?config=" + config).c_str());
}

enum Way { sim, verilog, bitbang, shared, own, tcl, wayCount };
constexpr const char* wayNames[] = {"sim", "verilog", "rbb", "openocd", "own", "tcl"};

/// The ways by turns, so many polls each; the counters are seconds.
template <class Model>
void polls(benchmark::State& state) {
  const auto width = static_cast<unsigned>(state.range(0));
  const unsigned turn = 2 + 400 / width;
  std::vector<QorRT::Qor_Scan> queue;
  qorrtl::RtlPins<Model> pins, pinsAlone;
  Client simClient(simulated(width), width, width);
  Client(std::make_unique<KeepingCable>(pins, queue), width, width);
  qorrtl::PinsCable alone(chainDevices, pinsAlone);

  ServedCore<Model> first, second, third;
  Client bitbangClient(QorRT::openCable(("rbb:127.0.0.1:" + first.port()).c_str()), width, width);
  const SharedServer server(second.port());
  const auto stream = server.connect();
  Client sharedClient(QorRT::openCable(server.url().c_str()), width, width);
  Client ownClient(ownServer(third.port()), width, width);
  TclLoop loop(*stream, queue);

  double seconds[wayCount] = {};
  const auto polling = [turn](Client& client) { return secondsOf(turn, [&] { client.poll(); }); };
  for (auto _ : state) {
    seconds[sim] += polling(simClient);
    seconds[bitbang] += polling(bitbangClient);
    seconds[shared] += polling(sharedClient);
    seconds[own] += polling(ownClient);
    seconds[tcl] += secondsOf(1, [&] { loop.run(turn); });
    seconds[verilog] += secondsOf(turn, [&] {
      for (const QorRT::Qor_Scan& scan : queue) {
        if (scan.kind == QorRT::Qor_Scan::Kind::ir) alone.scanIr(0, scan.userChain);
        if (scan.kind == QorRT::Qor_Scan::Kind::dr) alone.scanDr(0, scan.out, scan.bitCount, scan.capture);
      }
      alone.flush();
    });
  }
  const double count = static_cast<double>(state.iterations()) * turn;
  for (int way = 0; way < wayCount; ++way) state.counters[wayNames[way]] = seconds[way] / count;
  state.counters["exchanges"] = static_cast<double>(sharedClient.traffic.exchanges) / count;
}

/// Polls of 32 inputs and writes of 32 outputs, with a charge of so many microseconds for each run of the server's queue.
void charged(benchmark::State& state, bool isShared, bool writes) {
  const std::chrono::microseconds charge(state.range(0));
  ServedCore<Vwire32> board(charge);
  std::unique_ptr<SharedServer> server;
  if (isShared) server = std::make_unique<SharedServer>(board.port());
  if (isShared) server->connect();
  Client client(isShared ? QorRT::openCable(server->url().c_str()) : ownServer(board.port()), 32, 0);
  const std::uint64_t tcks = board.pins.tcks, runs = board.pins.runs;
  for (auto _ : state) writes ? client.write() : client.poll();
  const auto count = static_cast<double>(state.iterations());
  state.counters["per_second"] = benchmark::Counter(count, benchmark::Counter::kIsRate);
  state.counters["queue_runs"] = static_cast<double>(board.pins.runs - runs) / count;
  state.counters["TCKs"] = static_cast<double>(board.pins.tcks - tcks) / count;
  state.counters["bits"] = static_cast<double>(client.traffic.bits) / count;
}

/// After the lines of Google Benchmark, the table of polls().
class WireReporter : public benchmark::ConsoleReporter {
 public:
  WireReporter() : ConsoleReporter(OO_Tabular) {}

  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs)
      if (run.run_type == Run::RT_Iteration && !run.error_occurred && run.counters.count("tcl") != 0)
        addLines(run);
  }

  void Finalize() override {
    std::printf(
        "\nPolls of all inputs. Ratios of speed: to the same scans in a Tcl loop inside OpenOCD, and to the "
        "Verilog "
        "alone.\n\"openocd\" is a server that others may use, \"own\" one of our own\n%9s %9s %10s %8s "
        "%9s\n%s",
        "port bits", "way", "polls/s", "of tcl", "of verilog", table_.c_str());
  }

 private:
  void addLines(const Run& run) {
    const auto value = [&](const char* name) { return run.counters.at(name).value; };
    for (const char* way : wayNames) {
      char line[120];
      std::snprintf(line, sizeof line, "%9s %9s %10.1f %8.2f %9.2f\n", ("4 x " + run.run_name.args).c_str(),
                    way, 1 / value(way), value("tcl") / value(way), value("verilog") / value(way));
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

#define QOR_CHARGED(name, isShared, writes) \
  BENCHMARK_CAPTURE(charged, name, isShared, writes)->Arg(0)->Arg(125)->Arg(1000)->UseRealTime()
QOR_CHARGED(polls_shared, true, false);
QOR_CHARGED(polls_own, false, false);
QOR_CHARGED(writes_shared, true, true);
QOR_CHARGED(writes_own, false, true);

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  WireReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  return 0;
}
