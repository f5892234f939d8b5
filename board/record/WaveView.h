/// @file
/// What a wave viewer needs to show a value change dump as people read its signals.
#pragma once

#include <string>
#include <vector>

#include "board/Export.h"
#include "board/model/Signal.h"

namespace qor {

/// Writes beside the dump a save file for GTKWave, "counter.gtkw" for "counter.vcd", and for each signal with enumerated
/// names, or with a scale and at most 12 bits, a translate file that it names: "HEX text" lines. Returns the save file's
/// path. Throws WrongUse when the path does not end in .vcd, FileFailure when a file cannot be written.
QORBOARD_API std::string writeWaveView(const std::string& vcdPath, const std::vector<Signal>& signals,
                                       const std::vector<QOR_CORE_REF>& cores);

}  // namespace qor
