// What the shell offers for a word that is typed.
#pragma once

#include <CLI/CLI.hpp>
#include <string>
#include <vector>

#include "tools/qorvio/Settings.h"

namespace qor::tool {

/// Offered in the place of words: the shell is to complete file names.
inline const std::string fileNames = ":files";

/// What may be in the place of the last word, after the words before it, the program's name left out. The words are as
/// bash splits them: "=" and ":" are words of their own, and what is offered replaces only what follows them. Opens no
/// cable. Offers nothing that a shell would not take as it is.
std::vector<std::string> completions(const CLI::App& app, Settings settings,
                                     const std::vector<std::string>& words);

}  // namespace qor::tool
