// The manual page.
#pragma once

#include <CLI/CLI.hpp>
#include <string>

namespace qor::tool {

/// The page with its lines @OPTIONS@ and @COMMANDS@ replaced by what the application says of itself, as roff.
std::string manualPage(const CLI::App& app, const std::string& page);

}  // namespace qor::tool
