// Cable URLs as names of boards.
#pragma once

#include <string>

namespace qor {

/// One text for all spellings of a URL that reach the same board: kind and host in small letters, this machine and the
/// usual port by number, a configuration file by its whole path, without what only says how to get there (timeout, board).
std::string boardName(const std::string& url);

/// Whether the board is a new one in this process, whose outputs are 0.
bool isNewBoard(const std::string& url);

}  // namespace qor
