// The loops of python_loops.py in C++, by name as a host would write them: python_loops CASE COUNT SIGNALS prints seconds.
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <map>
#include <string>

#include "board/Board.h"
#include "board/record/Recording.h"

namespace {

using Loop = std::function<void(qor::Board&, unsigned)>;

volatile std::uint64_t sink = 0;

void readValue(qor::Board& board, unsigned count) {
  for (unsigned i = 0; i < count; ++i) sink = board.read("leds").number();
}

void readFrame(qor::Board& board, unsigned count) {
  for (unsigned i = 0; i < count; ++i) {
    const qor::Frame frame = board.read();
    sink = frame["leds"].number() + frame["state"].number() + frame["irq"].number();
  }
}

void sample(qor::Board& board, unsigned count) {
  qor::Limits limits;
  limits.samples = count;
  const std::vector<std::string> names{"leds", "state"};
  const auto inputs = board.signals().select(names, qor::Direction::input);
  sink = qor::recordToArrays(board.poller(), inputs, limits).nanoseconds.size();
}

void writeValue(qor::Board& board, unsigned count) {
  for (unsigned i = 0; i < count; ++i) board.write("leds", i & 0xFF);
}

void writeTwo(qor::Board& board, unsigned count) {
  for (unsigned i = 0; i < count; ++i) board.write({{"leds", i & 0xFF}, {"go", i & 1}});
}

void waitFor(qor::Board& board, unsigned count) {
  const qor::Condition condition = board.condition("leds == 0");
  for (unsigned i = 0; i < count; ++i) board.waitFor(condition, std::chrono::seconds(1));
}

}  // namespace

int main(int argc, char** argv) {
  const std::map<std::string, Loop> loops{{"value", readValue},    {"frame", readFrame},
                                          {"sample", sample},      {"write", writeValue},
                                          {"write two", writeTwo}, {"wait_for", waitFor}};
  if (argc != 4) return std::fprintf(stderr, "usage: python_loops CASE COUNT SIGNALS\n"), 2;
  qor::Board board("sim:", argv[3]);
  const auto begin = std::chrono::steady_clock::now();
  loops.at(argv[1])(board, static_cast<unsigned>(std::strtoul(argv[2], nullptr, 10)));
  const std::chrono::duration<double> time = std::chrono::steady_clock::now() - begin;
  std::printf("%.9f\n", time.count());
}
