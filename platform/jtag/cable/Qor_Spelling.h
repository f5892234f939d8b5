// What a misspelt name was meant to be.
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "QorExport.h"

namespace QorRT {

/// " (did you mean X?)" with the nearest of the names, without regard to the case of A to Z; empty when none is near.
QOR_API std::string didYouMean(std::string_view name, const std::vector<std::string_view>& known);

}  // namespace QorRT
