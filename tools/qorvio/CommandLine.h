// All commands with their options.
#pragma once

#include <CLI/CLI.hpp>

#include "tools/qorvio/Context.h"

namespace qor::tool {

/// Adds them to an empty application. The context must outlive it.
void addCommands(CLI::App& app, Context& context);

/// The commands that a script may contain, without the options that all have in common.
void addScriptCommands(CLI::App& app, Context& context);

}  // namespace qor::tool
