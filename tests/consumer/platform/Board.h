#pragma once

#include "QorExport.h"

/// The session that stands for the board in Core.cpp.
QOR_API unsigned openBoard();
