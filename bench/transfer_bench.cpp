// What one transfer costs the host, beside the time that its bits take on the wire at 30 MHz TCK.
#include <benchmark/benchmark.h>

#include <string>
#include <vector>

#include "QorVIO.h"
#include "bench/HeapUse.h"
#include "bench/NullPlatform.h"
#include "bench/PlainPorts.h"
#include "bench/TableReporter.h"

namespace {

using TextMap = QorRT::hash_map<std::string, std::string>;
using Bytes = std::vector<unsigned char>;

constexpr unsigned session = 1;
constexpr QOR_CORE_REF core{0, 1, 0};
constexpr double tckHertz = 30e6;

/// The bits of a scan beside payload or data: start, header and its CRC, head, room for waiting, CRC of the answer.
constexpr double writeFrameBits = 68 + 32 + 32 + 32, readFrameBits = 68 + 8 + 32;

/// A core with four ports of one width, and what it and its transfers cost.
class MeasuredCore {
 public:
  explicit MeasuredCore(unsigned width) {
    QorVIO_terminateCore(session, core);
    heapBefore_ = bench::heapBytes();
    bench::portWidth = width;
    QorVIO_initCore(session, core);
    exchangesBefore_ = bench::exchanges;
  }

  /// Reports the exchanges per call, the memory per port bit, and the time that `bits` take on the wire.
  void report(benchmark::State& state, double bits) const {
    const auto calls = static_cast<double>(state.iterations());
    state.counters["wire_us"] = bits / tckHertz * 1e6;
    state.counters["exchanges"] = static_cast<double>(bench::exchanges - exchangesBefore_) / calls;
    state.counters["bytes_per_port_bit"] =
        static_cast<double>(bench::heapBytes() - heapBefore_) / (4.0 * bench::portWidth);
  }

 private:
  std::size_t heapBefore_ = 0;
  std::size_t exchangesBefore_ = 0;
};

unsigned widthOf(const benchmark::State& state) {
  return static_cast<unsigned>(state.range(0));
}

Bytes portBytes(unsigned width, unsigned char fill) {
  return Bytes((width + 7) / 8, fill);
}

Bytes stepBytes(unsigned width) {
  return Bytes(16 * portBytes(width, 0).size(), 0x3C);
}

void writeWholePorts(benchmark::State& state) {
  const unsigned width = widthOf(state);
  const Bytes port = portBytes(width, 0x5A);
  const Bytes steps = stepBytes(width);
  const MeasuredCore measured(width);
  for (auto _ : state) {
    unsigned code =
        QorVIO_setPortBits(session, core, port.data(), port.data(), width, steps.data(), port.data(), width);
    if (code != 0) state.SkipWithError("the write failed");
  }
  measured.report(state, 19.0 * width + writeFrameBits);
}

void plain_writeWholePorts(benchmark::State& state) {
  const unsigned width = widthOf(state);
  const Bytes port = portBytes(width, 0x5A);
  const Bytes steps = stepBytes(width);
  bench::PlainPorts plain(width);
  for (auto _ : state) benchmark::DoNotOptimize(plain.write(port.data(), steps.data()));
}

void readWholePorts(benchmark::State& state) {
  const unsigned width = widthOf(state);
  std::vector<Bytes> b(8, portBytes(width, 0));
  const MeasuredCore measured(width);
  for (auto _ : state) {
    unsigned code =
        QorVIO_getPortBits(session, core, b[0].data(), b[1].data(), b[2].data(), width, b[3].data(),
                           b[4].data(), b[5].data(), b[6].data(), b[7].data(), width);
    if (code != 0) state.SkipWithError("the read failed");
  }
  measured.report(state, 10.0 * width + readFrameBits);
}

void plain_readWholePorts(benchmark::State& state) {
  const unsigned width = widthOf(state);
  std::vector<Bytes> ports(8, portBytes(width, 0));
  const Bytes result(10 * portBytes(width, 0).size(), 0x5A);
  bench::PlainPorts plain(width);
  for (auto _ : state) plain.read(result, ports);
}

/// As many names as the input ports have bits; the whole-port ones are taken away.
void readNames(benchmark::State& state) {
  const unsigned width = widthOf(state);
  const MeasuredCore measured(width);
  for (unsigned bit = 0; bit < width; ++bit)
    QorVIO_defineSignal(session, core, ("signal_" + std::to_string(bit)).c_str(), 3, bit);
  QorVIO_undefineName(session, core, "sync_in_data", 1);
  QorVIO_undefineName(session, core, "async_in_data", 3);
  TextMap values;
  TextMap* map = &values;
  for (auto _ : state)
    if (QorVIO_readValues(session, core, &map) != 0) state.SkipWithError("the read failed");
  if (values.size() != 4U * width) state.SkipWithError("a name is missing");
  measured.report(state, 10.0 * width + readFrameBits);
}

void wholePortWidths(benchmark::internal::Benchmark* benchmark) {
  for (int width : {32, 256, 4096, 65535}) benchmark->Arg(width);
}

BENCHMARK(writeWholePorts)->Apply(wholePortWidths);
BENCHMARK(plain_writeWholePorts)->Apply(wholePortWidths);
BENCHMARK(readWholePorts)->Apply(wholePortWidths);
BENCHMARK(plain_readWholePorts)->Apply(wholePortWidths);
BENCHMARK(readNames)->Arg(10)->Arg(1000)->Arg(10000);

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  bench::TableReporter reporter;
  benchmark::RunSpecifiedBenchmarks(&reporter);
  return 0;
}
