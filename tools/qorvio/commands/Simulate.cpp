// A simulated board that outlives its hosts, for every program that speaks remote_bitbang.
#include <cstdio>

#include <nlohmann/json.hpp>

#include "BitbangServer.h"
#include "Sim.h"
#include "board/model/Errors.h"
#include "os/Stop.h"
#include "tools/qorvio/Number.h"
#include "tools/qorvio/Report.h"
#include "tools/qorvio/commands/Commands.h"
#include "tools/qorvio/terminal/Printable.h"

namespace qor::tool {
namespace {

constexpr const char* host = "127.0.0.1";

struct SimulateOptions {
  std::string board;
  std::uint16_t port = 0;
};

std::unique_ptr<qorsim::Pins> powerUp(const std::string& board) {
  try {
    return (board.empty() ? qorsim::demoBoard() : qorsim::boardFile(board)).pins();
  } catch (const std::invalid_argument& error) {
    throw WrongUse(error.what());
  }
}

void printPlace(const std::string& board, unsigned port, bool json) {
  if (json) {
    std::printf(
        "%s\n",
        jsonLine({{"host", host}, {"port", port}, {"board", board.empty() ? "demo" : board}}).c_str());
  } else {
    std::printf("serving %s on %s:%u; cable rbb:%s:%u; Ctrl-C ends it\n",
                board.empty() ? "the demo board" : printable(board).c_str(), host, port, host, port);
  }
  std::fflush(stdout);
}

void simulate(const Settings& settings, const SimulateOptions& options) {
  const std::unique_ptr<qorsim::Pins> pins = powerUp(options.board);
  qorsim::BitbangServer server(*pins, options.port);
  const os::Stop stop;
  printPlace(options.board, server.port(), settings.json);
  server.serve(
      [&stop] { return stop.asked(); },
      [](const std::string& reason) { std::fprintf(stderr, "qorvio: %s\n", printable(reason).c_str()); });
}

}  // namespace

void addSimulate(CLI::App& app, Context& context) {
  auto options = std::make_shared<SimulateOptions>();
  CLI::App* command = app.add_subcommand("simulate", "a simulated board, kept alive for other programs");
  command->add_option("BOARD", options->board, "a file that describes it; the demo board without one");
  command->add_option("--port", options->port, "where it listens on this machine; any free port without it")
      ->check(wholeNumber(0, 65535));
  command->footer(
      "It speaks remote_bitbang to one client after another, and stays as each leaves it.\n\n"
      "Example:\n  qorvio simulate --port 9824");
  command->callback([&context, options] { simulate(context.settings, *options); });
}

}  // namespace qor::tool
