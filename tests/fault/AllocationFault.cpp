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

using std::align_val_t;
using std::nothrow_t;
using std::size_t;

// clang-format off
void* operator new(size_t n) { return orThrow(allocate(n)); }
void* operator new[](size_t n) { return orThrow(allocate(n)); }
void* operator new(size_t n, const nothrow_t&) noexcept { return allocate(n); }
void* operator new[](size_t n, const nothrow_t&) noexcept { return allocate(n); }
void* operator new(size_t n, align_val_t a) { return orThrow(allocate(n, static_cast<size_t>(a))); }
void* operator new[](size_t n, align_val_t a) { return orThrow(allocate(n, static_cast<size_t>(a))); }
void* operator new(size_t n, align_val_t a, const nothrow_t&) noexcept { return allocate(n, static_cast<size_t>(a)); }
void* operator new[](size_t n, align_val_t a, const nothrow_t&) noexcept { return allocate(n, static_cast<size_t>(a)); }

void operator delete(void* p) noexcept { release(p); }
void operator delete[](void* p) noexcept { release(p); }
void operator delete(void* p, size_t) noexcept { release(p); }
void operator delete[](void* p, size_t) noexcept { release(p); }
void operator delete(void* p, const nothrow_t&) noexcept { release(p); }
void operator delete[](void* p, const nothrow_t&) noexcept { release(p); }
void operator delete(void* p, align_val_t) noexcept { release(p); }
void operator delete[](void* p, align_val_t) noexcept { release(p); }
void operator delete(void* p, size_t, align_val_t) noexcept { release(p); }
void operator delete[](void* p, size_t, align_val_t) noexcept { release(p); }
void operator delete(void* p, align_val_t, const nothrow_t&) noexcept { release(p); }
void operator delete[](void* p, align_val_t, const nothrow_t&) noexcept { release(p); }
