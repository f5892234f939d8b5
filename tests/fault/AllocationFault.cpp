#include "tests/fault/AllocationFault.h"

#include <cstdlib>
#include <new>

namespace {

bool isArmed = false, hasFailed = false, allFail = false;
std::size_t remaining = 0;  // allocations before the one that fails
std::size_t live = 0;

bool mustFail() {
  if (!isArmed || (hasFailed && !allFail)) return false;
  if (remaining == 0) return hasFailed = true;
  --remaining;
  return false;
}

}  // namespace

namespace allocation_fault {

void arm(std::size_t first, bool all) {
  remaining = first;
  allFail = all;
  hasFailed = false;
  isArmed = true;
}

bool disarm() noexcept {
  isArmed = false;
  return hasFailed;
}

std::size_t liveBlocks() noexcept {
  return live;
}

}  // namespace allocation_fault

// The others call these.
void* operator new(std::size_t size) {
  void* const block = mustFail() ? nullptr : std::malloc(size != 0 ? size : 1);
  if (block == nullptr) throw std::bad_alloc();
  ++live;
  return block;
}
void operator delete(void* block) noexcept {
  if (block != nullptr) --live;
  std::free(block);
}
void operator delete(void* block, std::size_t) noexcept {
  operator delete(block);
}
