// The status word of a core.
#pragma once

#include "SimCoreDescription.h"
#include "sim/Bits.h"

namespace qorsim {

/// Where a VIO core keeps its port widths depends on its version: fields of 8 bits before 6.2, of 16 bits
/// from then on, and of 16 bits after the cg version from 10.0 on.
enum class StatusLayout { oldest, middle, current };

StatusLayout statusLayout(const CoreDescription& core);

/// The widest port that the status word of the core can give.
unsigned widestPort(const CoreDescription& core);

/// The 128 bits that code 00 delivers.
Bits statusWord(const CoreDescription& core);

}  // namespace qorsim
