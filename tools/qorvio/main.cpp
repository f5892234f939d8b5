#include <cstdio>
#include <exception>

#include "board/model/Errors.h"
#include "os/StandardStreams.h"
#include "tools/qorvio/commands/Commands.h"

namespace {

enum ExitStatus { done = 0, deviceFailed = 1, wrongUse = 2 };

constexpr qor::tool::AddCommand commands[] = {
    qor::tool::addScan,     qor::tool::addInfo,     qor::tool::addSignals, qor::tool::addRead,
    qor::tool::addWrite,    qor::tool::addGestures, qor::tool::addPort,    qor::tool::addWatch,
    qor::tool::addRecord,   qor::tool::addPlay,     qor::tool::addDoctor,  qor::tool::addBench,
    qor::tool::addSimulate,
};

int complain(const char* what, ExitStatus status) {
  std::fflush(stdout);
  std::fprintf(stderr, "qorvio: %s\n", what);
  return status;
}

int runCommand(CLI::App& app, int argc, char** argv) {
  try {
    app.parse(argc, argv);
    return done;
  } catch (const CLI::Success& asked) {  // help or version
    return app.exit(asked);
  } catch (const CLI::ParseError& error) {
    if (app.get_subcommands().empty() && !app.remaining().empty())
      return complain(("no such command: " + app.remaining().front()).c_str(), wrongUse);
    return complain(error.what(), wrongUse);
  } catch (const qor::WrongUse& error) {
    return complain(error.what(), wrongUse);
  } catch (const std::exception& error) {
    return complain(error.what(), deviceFailed);
  }
}

void addSettings(CLI::App& app, qor::tool::Settings& settings) {
  app.add_option("--cable", settings.cable,
                 "the board: sim:, sim:BOARD.toml, rbb:HOST:PORT, openocd:HOST:PORT or openocd:?config=FILE "
                 "(QORVIO_CABLE)")
      ->type_name("URL");
  app.add_option("--core", settings.core, "the core, else the first VIO core (QORVIO_CORE)")
      ->type_name("DEVICE.CHAIN.INDEX");
  app.add_option("--signals", settings.signals, "names for its bits (QORVIO_SIGNALS)")->type_name("FILE");
  app.add_flag("--force-core", settings.forceCore, "use --core though the signals file is for another core");
  app.add_flag("--json", settings.json, "results as JSON");
  app.add_flag("--quiet", settings.quiet, "no progress, no remarks");
  app.parse_complete_callback([&settings] { settings.complete(); });
}

int runTool(int argc, char** argv) {
  CLI::App app{"Virtual inputs and outputs inside an FPGA, by name.", "qorvio"};
  qor::tool::Context context;
  app.require_subcommand(1);
  app.fallthrough();
  app.set_version_flag("--version", "qorvio " QORVIO_VERSION);
  addSettings(app, context.settings);
  app.footer("Example:\n  qorvio scan\n  qorvio COMMAND --help");
  for (const qor::tool::AddCommand add : commands) add(app, context);
  return runCommand(app, argc, argv);
}

}  // namespace

int main(int argc, char** argv) {
  os::openMissingStreams();
  int status = deviceFailed;
  try {
    status = runTool(argc, argv);
  } catch (const std::exception& error) {
    status = complain(error.what(), deviceFailed);
  }
  if (std::fflush(stdout) != 0 || std::ferror(stdout) != 0)
    return complain("cannot write the output: stdout", deviceFailed);
  return status;
}
