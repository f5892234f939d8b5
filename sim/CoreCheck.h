// The limits that a core's status word sets.
#pragma once

#include <string>

#include "SimCoreDescription.h"

namespace qorsim {

/// Throws BoardError, with `part` in its text, when a value is out of its range.
void requireRange(const std::string& part, const char* key, unsigned value, unsigned least, unsigned most);

/// Throws BoardError, with `part` in its text, for what no status word can say or no core of the type has.
void checkCore(const std::string& part, const CoreDescription& core);

}  // namespace qorsim
