#include "bench/HeapUse.h"

#include <malloc.h>

namespace bench {

std::size_t heapBytes() {
  const auto info = mallinfo2();
  return info.uordblks + info.hblkhd;
}

}  // namespace bench
