// What `qorvio record` makes of the reads of the library: its samples beside bare reads of the same core, taken by turns.
#include <benchmark/benchmark.h>

#include <chrono>
#include <cstdio>
#include <filesystem>
#include <string>
#include <vector>

#include "Sim.h"
#include "board/record/Recording.h"
#include "board/session/LocalCore.h"

namespace {

namespace fs = std::filesystem;

/// Design clocks per poll: 24, after which every bit is as before; or 3, after which every bit has changed.
enum Bits : unsigned { staying, changing };
constexpr unsigned tcksPerClock[] = {1, 8};
constexpr const char* bitsNames[] = {"stay", "change"};
constexpr const char* endings[] = {"vcd", "csv", "jsonl"};

std::unique_ptr<QorRT::Qor_Cable> boardOf(unsigned width, unsigned bits) {
  return qorsim::chain()
      .device(0x11)
      .core(1, 0, qorsim::vio().asyncIn(width).design(qorsim::toggle()))
      .tcksPerClock(tcksPerClock[bits])
      .cable();
}

std::vector<qor::Signal> signalsOf(unsigned width) {
  std::vector<qor::Signal> signals(width);
  for (unsigned bit = 0; bit < width; ++bit) {
    signals[bit].name = "signal_" + std::to_string(bit);
    signals[bit].bits = {bit};
  }
  return signals;
}

template <class Action>
double secondsOf(Action action) {
  const auto begin = std::chrono::steady_clock::now();
  action();
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - begin).count();
}

/// A recording, file and all, and as many reads without one.
void record(benchmark::State& state) {
  const auto width = static_cast<unsigned>(state.range(0));
  qor::Link link(boardOf(width, static_cast<unsigned>(state.range(2))));
  qor::LocalCore core(link, {0, 1, 0});
  qor::Poller poller({&core});
  const std::vector<qor::Signal> signals = signalsOf(width);
  const std::string path =
      fs::temp_directory_path() / (std::string("recorder_bench.") + endings[state.range(1)]);
  qor::Limits limits;
  limits.samples = 800 + 80000 / width;
  qor::Sample sample = qor::emptySample(core.info());
  double recorded = 0, bare = 0;
  for (auto _ : state) {
    recorded += secondsOf([&] { qor::recordTo(path, poller, signals, limits); });
    bare += secondsOf([&] {
      for (std::uint64_t i = 0; i < limits.samples; ++i) core.read(sample);
    });
  }
  fs::remove(path);
  const double samples = static_cast<double>(limits.samples) * static_cast<double>(state.iterations());
  state.counters["samples_per_s"] = samples / recorded;
  state.counters["bare_reads_per_s"] = samples / bare;
  state.counters["own_ns"] = (recorded - bare) / samples * 1e9;
}

/// After the lines of Google Benchmark, the table that they are for.
class RecorderReporter : public benchmark::ConsoleReporter {
 public:
  RecorderReporter() : ConsoleReporter(OO_Tabular) {}

  void ReportRuns(const std::vector<Run>& runs) override {
    ConsoleReporter::ReportRuns(runs);
    for (const Run& run : runs)
      if (run.run_type == Run::RT_Iteration && !run.error_occurred) addLine(run);
  }

  void Finalize() override {
    std::printf(
        "\nRecordings of one-bit signals at the full rate; ratio: samples to bare reads of the library\n");
    std::printf("%7s %6s %6s %12s %12s %9s %6s\n%s", "signals", "file", "bits", "samples/s", "reads/s",
                "own ns", "ratio", table_.c_str());
  }

 private:
  void addLine(const Run& run) {
    unsigned width = 0, ending = 0, bits = 0;
    if (std::sscanf(run.run_name.args.c_str(), "%u/%u/%u", &width, &ending, &bits) != 3) return;
    const double samples = run.counters.at("samples_per_s"), reads = run.counters.at("bare_reads_per_s");
    char line[100];
    std::snprintf(line, sizeof line, "%7u %6s %6s %12.0f %12.0f %9.0f %6.2f\n", width, endings[ending],
                  bitsNames[bits], samples, reads, run.counters.at("own_ns").value, samples / reads);
    table_ += line;
  }

  std::string table_;
};

BENCHMARK(record)
    ->ArgsProduct({{8, 256, 4096}, {0, 1, 2}, {staying, changing}})
    ->Unit(benchmark::kMillisecond);

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  RecorderReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  return 0;
}
