// Bounds that a TOML text must keep before it is parsed: the parser calls itself for each level of nesting.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace QorRT {

constexpr std::size_t mostTomlBytes = 1 << 20;

/// Of arrays and inline tables within each other, and of the parts of one key or table name.
constexpr unsigned mostTomlLevels = 16;

/// Throws invalid_argument, "FILE: what is wrong" or "FILE:LINE: what is wrong", for a text that is too long or nested too
/// deeply. `file` is the name that messages give the text.
void requireTomlBounds(std::string_view text, const std::string& file);

}  // namespace QorRT
