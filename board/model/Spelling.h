// What a misspelt name was meant to be.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "board/Export.h"

namespace qor {

/// " (did you mean X?)" with the nearest of the names, without regard to the case of A to Z; empty when none is near.
QORBOARD_API std::string didYouMean(std::string_view name, const std::vector<std::string_view>& known);

}  // namespace qor
