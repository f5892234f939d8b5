/// @file
/// Names for a core's bits from the design that it is placed in.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "board/Export.h"
#include "board/model/Signal.h"

namespace qor {

/// What is meant of a netlist; empty where there is only one.
struct NetlistPlace {
  std::string instance{};  ///< of qor_vio
  std::string module{};    ///< its ports are meant, as if each were connected to the core, from bit 0 on
};

/// The nets that a qor_vio instance is connected to, as signals of its ports: a signal for each row of bits of one net. In
/// a netlist without an instance, or where a module is named, that module's ports instead: its outputs are the core's
/// asynchronous inputs, its inputs the core's outputs. `json` is what yosys' write_json makes; `path` is for messages.
/// Throws WrongUse: for a text that is no netlist, and where it is not clear what is meant, with what there is.
QORBOARD_API std::vector<Signal> netlistSignals(std::string_view json, const std::string& path,
                                                const NetlistPlace& place = {});

}  // namespace qor
