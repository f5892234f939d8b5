// Whole numbers as options.
#pragma once

#include <CLI/CLI.hpp>
#include <cstdint>

namespace qor::tool {

/// Refuses every other text: signs, fractions, and what is out of range.
CLI::Validator wholeNumber(std::uint64_t least, std::uint64_t most);

}  // namespace qor::tool
