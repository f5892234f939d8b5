// Stand-ins for sessions, core list and transport that cost nothing: what is left to measure is the library's
// own work, conversions included.
#pragma once

namespace bench {

/// The width in bits of all four ports of the core that status reads report.
extern unsigned portWidth;

}  // namespace bench
