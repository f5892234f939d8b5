// The factories behind the table of cable URLs: each opens the cable that the rest of a URL describes.
#pragma once

#include <memory>
#include <string>

#include "Qor_Cable.h"

namespace QorRT {

/// `sim:` the demo board; `sim:board.toml` the board that the file describes. Throws with what is wrong in
/// the file.
std::unique_ptr<Qor_Cable> openSimulatedCable(const std::string& boardFile);

}  // namespace QorRT
