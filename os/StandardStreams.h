// Standard input, output and error.
#pragma once

#include <string_view>

#include "os/Stop.h"

namespace os {

enum class Stream { input, output, error };

/// Opens /dev/null for each of them that the process was started without, so that no file or socket takes its number.
/// To be called first of all.
void openMissingStreams();

bool isTerminal(Stream stream);

/// Writes all of it to standard output; signals do not end it, except that a Stop that is asked for while nothing more is
/// taken leaves the rest: then false. Throws std::runtime_error when standard output fails.
bool writeOutput(std::string_view text, const Stop& stop);

}  // namespace os
