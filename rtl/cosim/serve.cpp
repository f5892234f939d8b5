// The Verilog demo board behind a remote_bitbang server: serve_demo [PORT]. Says its port, then serves until it is
// interrupted.
#include <csignal>
#include <cstdint>
#include <cstdio>
#include <exception>
#include <string>

#include "BitbangServer.h"
#include "rtl/cosim/RtlPins.h"
#include MODEL_HEADER

namespace {

volatile std::sig_atomic_t interrupted = 0;

extern "C" void interrupt(int) {
  interrupted = 1;
}

}  // namespace

int main(int argc, char** argv) {
  try {
    std::signal(SIGINT, interrupt);
    std::signal(SIGTERM, interrupt);
    qorrtl::RtlPins<MODEL> pins;
    qorsim::BitbangServer server(pins, static_cast<std::uint16_t>(argc > 1 ? std::stoul(argv[1]) : 0));
    std::printf("%u\n", unsigned{server.port()});
    std::fflush(stdout);
    server.serve([] { return interrupted != 0; },
                 [](const std::string& why) { std::fprintf(stderr, "serve_demo: %s\n", why.c_str()); });
    return 0;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "serve_demo: %s\n", error.what());
    return 1;
  }
}
