#pragma once
// The allocation behaviours behind every allocator of the shared heap.
//
// Throwing: malloc; on failure the runtime's new handler is called and, while it asks for a
// retry, malloc is tried again; then vyn::ThrowOutOfMemory. Never null.
// Non-throwing: the same, with null in place of any exception (the new handler's included).

#include <cstddef>
#include <cstdlib>

namespace vyn {

// The slow path of AllocateOrThrow, after malloc has failed once.
void* AllocateAfterFailure(std::size_t size);

inline void* AllocateOrThrow(std::size_t size) {
  if (void* block = std::malloc(size)) [[likely]]
    return block;
  return AllocateAfterFailure(size);
}

void* AllocateOrNull(std::size_t size) noexcept;

// Blocks aligned to alignment (a power of two), released with free().
void* AllocateAlignedOrThrow(std::size_t size, std::size_t alignment);
void* AllocateAlignedOrNull(std::size_t size, std::size_t alignment) noexcept;

}  // namespace vyn
