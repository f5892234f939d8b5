// What names and texts may be made of, in UTF-8.
#pragma once

#include <string_view>

namespace qor {

/// Letters, digits, _, - and /, at least one; letters of every script.
bool isSignalName(std::string_view text);

/// Whether the byte can be part of a signal name.
bool isNameByte(char letter);

/// Whether a terminal would obey a part of it, or it is no UTF-8.
bool hasControls(std::string_view text);

}  // namespace qor
