// NAME=VALUE as the command line gives it.
#pragma once

#include <string>

#include "tools/qorvio/Context.h"

namespace qor::tool {

/// "NAME=VALUE", or "NAME.pulsetrain=V0,V1,...". Throws WrongUse.
Assignment parseAssignment(const SignalTable& signals, const std::string& text);

/// With --json, tells on stdout what was written.
void printWritten(const Context& context, const std::vector<Assignment>& assignments);

}  // namespace qor::tool
