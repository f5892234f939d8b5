#include "tools/qorvio/CommandLine.h"

#include "tools/qorvio/commands/Commands.h"

namespace qor::tool {
namespace {

constexpr AddCommand scriptCommands[] = {
    addScan,   addInfo,   addSignals, addRead,   addWrite, addOutputs, addBitCommands, addPort,   addWait,
    addExpect, addEvents, addRecord,  addRender, addPlay,  addDoctor,  addBench,       addProbes,
};
constexpr AddCommand otherCommands[] = {addWatch, addRun, addSimulate};

}  // namespace

void addScriptCommands(CLI::App& app, Context& context) {
  for (const AddCommand add : scriptCommands) add(app, context);
}

void addCommands(CLI::App& app, Context& context) {
  app.name("qorvio");
  app.description("Virtual inputs and outputs inside an FPGA, by name.");
  app.require_subcommand(1);
  app.fallthrough();
  app.set_version_flag("--version", "qorvio " QORVIO_VERSION);
  context.settings.addOptions(app);
  app.parse_complete_callback([&context] { context.settings.complete(); });
  app.footer("Example:\n  qorvio scan\n  qorvio COMMAND --help");
  addScriptCommands(app, context);
  for (const AddCommand add : otherCommands) add(app, context);
}

}  // namespace qor::tool
