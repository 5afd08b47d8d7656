// The throwing and non-throwing allocation loops of the shared heap.

#include "foundation/heap_allocation.h"

#include <cstdint>

#include "foundation/out_of_memory.h"
#include "win32/crt_heap.h"

namespace vyn {

namespace {

// One attempt at an aligned block; null when it cannot be had.
void* TryAllocateAligned(std::size_t size, std::size_t alignment) noexcept {
  // aligned_alloc wants a size that is a multiple of the alignment.
  if (size > SIZE_MAX - (alignment - 1)) return nullptr;
  const std::size_t rounded = size == 0 ? alignment : (size + alignment - 1) & ~(alignment - 1);
  return std::aligned_alloc(alignment, rounded);
}

}  // namespace

void* AllocateAfterFailure(std::size_t size) {
  for (;;) {
    if (win32::_callnewh(size) == 0) ThrowOutOfMemory(size);
    if (void* block = std::malloc(size)) return block;
  }
}

void* AllocateOrNull(std::size_t size) noexcept {
  if (void* block = std::malloc(size)) [[likely]]
    return block;
  try {
    return AllocateAfterFailure(size);
  } catch (...) {
    return nullptr;
  }
}

void* AllocateAlignedOrThrow(std::size_t size, std::size_t alignment) {
  for (;;) {
    if (void* block = TryAllocateAligned(size, alignment)) return block;
    if (win32::_callnewh(size) == 0) ThrowOutOfMemory(size);
  }
}

void* AllocateAlignedOrNull(std::size_t size, std::size_t alignment) noexcept {
  try {
    return AllocateAlignedOrThrow(size, alignment);
  } catch (...) {
    return nullptr;
  }
}

}  // namespace vyn
