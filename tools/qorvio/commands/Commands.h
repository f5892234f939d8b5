// The commands. Each adds itself to the command line, with a help text that ends in an example.
#pragma once

#include <CLI/CLI.hpp>

#include "tools/qorvio/Context.h"

namespace qor::tool {

using AddCommand = void (*)(CLI::App& app, Context& context);

void addScan(CLI::App& app, Context& context);
void addInfo(CLI::App& app, Context& context);
void addSignals(CLI::App& app, Context& context);
void addRead(CLI::App& app, Context& context);
void addWrite(CLI::App& app, Context& context);
void addBitCommands(CLI::App& app, Context& context);  // pulse, toggle, press
void addPort(CLI::App& app, Context& context);
void addWatch(CLI::App& app, Context& context);
void addRecord(CLI::App& app, Context& context);
void addPlay(CLI::App& app, Context& context);
void addDoctor(CLI::App& app, Context& context);
void addBench(CLI::App& app, Context& context);
void addWait(CLI::App& app, Context& context);
void addExpect(CLI::App& app, Context& context);
void addEvents(CLI::App& app, Context& context);
void addProbes(CLI::App& app, Context& context);
void addOutputs(CLI::App& app, Context& context);
void addRun(CLI::App& app, Context& context);
void addSimulate(CLI::App& app, Context& context);
void addRender(CLI::App& app, Context& context);

}  // namespace qor::tool
