/// @file
/// Signals files: TOML with names for port bits.
///
///     core = "0.1.0"            # whose bits they are; the first VIO core when it is not given
///     [[signal]]
///     name = "state"            # letters, digits, _ - /
///     port = "async_in"         # async_out, sync_out, async_in, sync_in
///     bits = "7:4"              # one bit, a range or a list, most significant first
///     radix = "dec"             # hex, bin, dec, signed
///     enum = { IDLE = 0 }       # names of values
///     scale = 0.5               # what one step is worth
///     unit = "V"
///     core = "1.1.0"            # another core than the file's
///     description = "..."
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "board/Export.h"
#include "board/model/SignalTable.h"

namespace qor {

/// Throws WrongUse, "FILE:LINE: KEY: what is wrong".
QORBOARD_API SignalTable readSignalFile(const std::string& path);

/// A first signals file for a core: a signal for each port, ready to be renamed and divided.
QORBOARD_API std::string firstSignalFile(QOR_CORE_REF ref, const QORVIO_CORE_INFO& info);

/// A signals file of these signals: their names, ports and bits; without a core, of any.
QORBOARD_API std::string signalFileText(const std::optional<QOR_CORE_REF>& ref,
                                        const std::vector<Signal>& signals);

}  // namespace qor
