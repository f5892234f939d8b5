#include "tools/qorvio/CommandLine.h"

#include "tools/qorvio/commands/Commands.h"

namespace qor::tool {
namespace {

constexpr AddCommand commands[] = {
    addScan,  addInfo,   addSignals, addRead,   addWrite, addBitCommands, addPort,
    addWatch, addRecord, addPlay,    addDoctor, addBench, addSimulate,    addRender,
};

}  // namespace

void addCommands(CLI::App& app, Context& context) {
  app.name("qorvio");
  app.description("Virtual inputs and outputs inside an FPGA, by name.");
  app.require_subcommand(1);
  app.fallthrough();
  app.set_version_flag("--version", "qorvio " QORVIO_VERSION);
  context.settings.addOptions(app);
  app.parse_complete_callback([&context] { context.settings.complete(); });
  app.footer("Example:\n  qorvio scan\n  qorvio COMMAND --help");
  for (const AddCommand add : commands) add(app, context);
}

}  // namespace qor::tool
