// What one transfer costs the host, beside the time that its bits take on the wire at 30 MHz TCK.
#include <benchmark/benchmark.h>

#include <string>
#include <vector>

#include "NullSiblings.h"
#include "QorVIO.h"

namespace {

using TextMap = QorRT::hash_map<std::string, std::string>;
using Bytes = std::vector<unsigned char>;

constexpr unsigned session = 1;
constexpr QOR_CORE_REF core{0, 1, 0};
constexpr double tckHertz = 30e6;
constexpr unsigned bitsAName = 8;

unsigned setUpCore(const benchmark::State& state) {
  bench::portWidth = static_cast<unsigned>(state.range(0));
  QorVIO_initCore(session, core);
  return bench::portWidth;
}

/// Reports the time of one iteration as a share of the time that `bits` take on the wire.
void reportShareOfWire(benchmark::State& state, double bits) {
  state.counters["wire_us"] = bits / tckHertz * 1e6;
  state.counters["percent_of_wire"] = benchmark::Counter(
      bits / tckHertz / 100, benchmark::Counter::kIsIterationInvariantRate | benchmark::Counter::kInvert);
}

void writeWholePorts(benchmark::State& state) {
  const unsigned width = setUpCore(state);
  const Bytes port((width + 7) / 8, 0x5A);
  const Bytes steps(16 * port.size(), 0x3C);
  for (auto _ : state) {
    unsigned code =
        QorVIO_setPortBits(session, core, port.data(), port.data(), width, steps.data(), port.data(), width);
    if (code != 0) state.SkipWithError("the write failed");
  }
  reportShareOfWire(state, 19.0 * width);
}

void readWholePorts(benchmark::State& state) {
  const unsigned width = setUpCore(state);
  std::vector<Bytes> b(8, Bytes((width + 7) / 8));
  for (auto _ : state) {
    unsigned code =
        QorVIO_getPortBits(session, core, b[0].data(), b[1].data(), b[2].data(), width, b[3].data(),
                           b[4].data(), b[5].data(), b[6].data(), b[7].data(), width);
    if (code != 0) state.SkipWithError("the read failed");
  }
  reportShareOfWire(state, 10.0 * width);
}

/// Reads by name: every input bit belongs to a bus of eight.
void readNames(benchmark::State& state) {
  const unsigned width = setUpCore(state);
  for (unsigned first = 0; first + bitsAName <= width; first += bitsAName) {
    std::vector<unsigned> bits(bitsAName);
    for (unsigned i = 0; i < bitsAName; ++i) bits[i] = first + i;
    for (unsigned type : {1U, 3U})
      QorVIO_defineBus(session, core, ("bus" + std::to_string(first) + "_" + std::to_string(type)).c_str(),
                       type, bits.data(), bitsAName);
  }
  QorVIO_undefineName(session, core, "sync_in_data", 1);
  QorVIO_undefineName(session, core, "async_in_data", 3);
  TextMap values;
  TextMap* map = &values;
  for (auto _ : state)
    if (QorVIO_readValues(session, core, &map) != 0) state.SkipWithError("the read failed");
  state.counters["names"] = static_cast<double>(width / bitsAName * 2);
  reportShareOfWire(state, 10.0 * width);
}

BENCHMARK(writeWholePorts)->Arg(32)->Arg(256)->Arg(4096)->Arg(65535);
BENCHMARK(readWholePorts)->Arg(32)->Arg(256)->Arg(4096)->Arg(65535);
BENCHMARK(readNames)->Arg(32)->Arg(256)->Arg(4096)->Arg(65535)->Unit(benchmark::kMicrosecond);

}  // namespace
