// An allocator for the whole program that fails on demand.
#pragma once

#include <cstddef>

namespace allocation_fault {

/// After `first` more allocations the next one fails, or all from there on.
void arm(std::size_t first, bool all);

/// No more fail; true when one has.
bool disarm() noexcept;

std::size_t liveBlocks() noexcept;

}  // namespace allocation_fault
