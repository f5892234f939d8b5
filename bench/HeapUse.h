// How much memory the program uses.
#pragma once

#include <cstddef>

namespace bench {

/// Bytes allocated and not yet freed, as the allocator rounds them.
std::size_t heapBytes();

}  // namespace bench
