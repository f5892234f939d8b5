// Reading a file that describes a board. Failures are invalid_argument, "FILE: what is wrong" or "FILE:LINE: what is
// wrong".
#pragma once

#include <toml++/toml.h>
#include <string>

namespace QorRT {

std::string fileContents(const std::string& path);

/// `file` is the name that messages give the text.
toml::table parseToml(const std::string& text, const std::string& file);

}  // namespace QorRT
