// What was written, as JSON.
#pragma once

#include <string>

#include "tools/qorvio/Context.h"

namespace qor::tool {

/// With --json, reports on stdout what was written.
void printWritten(const Context& context, const std::vector<Assignment>& assignments);

}  // namespace qor::tool
