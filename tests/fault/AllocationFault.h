// A program's operator new that can be told to fail. For programs of one thread.
#pragma once

#include <cstddef>

namespace allocation_fault {

enum class Extent { one, allFromThereOn };

/// From now on allocation number `first`, counted from 0, fails, and those after it as `extent` says.
void arm(std::size_t first, Extent extent);

/// Nothing fails any more. True when something has failed since arm().
bool disarm() noexcept;

/// The blocks that are allocated and not freed.
std::size_t liveBlocks() noexcept;

}  // namespace allocation_fault
