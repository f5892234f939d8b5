#include "tests/fault/AllocationFault.h"

#include <algorithm>
#include <cstdlib>
#include <new>

namespace {

using allocation_fault::Extent;

bool isArmed = false, hasFailed = false;
std::size_t remaining = 0;  // allocations before the one that fails
Extent extentOfFault = Extent::one;
std::size_t live = 0;

bool mustFail() {
  if (!isArmed || (hasFailed && extentOfFault == Extent::one)) return false;
  if (remaining == 0) return hasFailed = true;
  --remaining;
  return false;
}

void* allocate(std::size_t size, std::size_t alignment = __STDCPP_DEFAULT_NEW_ALIGNMENT__) noexcept {
  if (mustFail()) return nullptr;
  void* const block =
      std::aligned_alloc(alignment, (std::max<std::size_t>(size, 1) + alignment - 1) / alignment * alignment);
  if (block != nullptr) ++live;
  return block;
}

void* orThrow(void* block) {
  if (block == nullptr) throw std::bad_alloc();
  return block;
}

void release(void* block) noexcept {
  if (block != nullptr) --live;
  std::free(block);
}

}  // namespace

namespace allocation_fault {

void arm(std::size_t first, Extent extent) {
  remaining = first;
  extentOfFault = extent;
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
  return orThrow(allocate(size));
}
void* operator new(std::size_t size, std::align_val_t alignment) {
  return orThrow(allocate(size, static_cast<std::size_t>(alignment)));
}
void operator delete(void* block) noexcept {
  release(block);
}
void operator delete(void* block, std::size_t) noexcept {
  release(block);
}
void operator delete(void* block, std::align_val_t) noexcept {
  release(block);
}
void operator delete(void* block, std::size_t, std::align_val_t) noexcept {
  release(block);
}
