// Folders.
#pragma once

#include <string>

namespace os {

/// Whether it is a folder in which files can be made.
bool isWritableFolder(const std::string& path);

}  // namespace os
