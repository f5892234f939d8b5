// A host of named signals: drives the simulated board by the names of a signals file, and waits for what it does.
#include <cstdio>

#include "board/Board.h"

using namespace std::chrono_literals;

int main(int argc, char** argv) {
  if (argc != 2) return std::fprintf(stderr, "usage: named_host examples/boards/demo-signals.toml\n"), 2;
  try {
    qor::Board board("sim:", argv[1]);
    board.write({{"leds", 0xA}, {"mode", "fast"}, {"gain", -1.5}, {"go", qor::pulse(3)}});
    const qor::Frame frame = board.waitFor("mode", "fast", 2s);
    std::printf("leds = %s, mode = %s, gain = %s, ready %s\n", frame["leds"].text().c_str(),
                frame["mode"].text().c_str(), frame["gain"].text().c_str(),
                frame["ready"].rose() ? "rose" : "did not rise");
    board.waitFor(board.condition("count moves && gain < -1 dB"), 2s);
    return frame["leds"] == 0xA && frame["ready"].rose() ? 0 : 1;
  } catch (const qor::Error& error) {
    std::fprintf(stderr, "named_host: %s\n", error.what());
    return 1;
  }
}
