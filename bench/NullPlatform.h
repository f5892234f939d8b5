// Replacements for sessions, core list and transport that cost nothing: what is left to measure is the library's
// own work, conversions included.
#pragma once

#include <cstddef>

namespace bench {

/// The width in bits of all four ports of the core that status reads report.
extern unsigned portWidth;

/// Command texts run since the program started: each would be one exchange with the adapter.
extern std::size_t exchanges;

}  // namespace bench
