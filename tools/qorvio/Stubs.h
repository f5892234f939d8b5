// Types of a signals file's names, for editors and type checkers of Python.
#pragma once

#include <string>

#include "board/model/SignalTable.h"

namespace qor::tool {

/// The text of a .pyi file with a class Board, whose attributes are the signals, and a class Frame. Names that are none of
/// Python's, or those of methods, are left out: they are items, board["cpu/state"].
std::string stubsOf(const SignalTable& signals);

}  // namespace qor::tool
