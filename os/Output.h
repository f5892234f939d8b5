// Standard output that may block for long, and still lets a Stop be heard.
#pragma once

#include <string_view>

#include "os/Stop.h"

namespace qor {

/// Writes all of it; signals do not end it, except that a Stop that is asked for while nothing more is taken leaves the
/// rest: then false. Throws runtime_error when standard output fails.
bool writeOutput(std::string_view text, const Stop& stop);

}  // namespace qor
