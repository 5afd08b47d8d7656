// The shared heap's free functions: untyped blocks, aligned blocks, the plain malloc/free pair,
// the debug break and the out-of-memory signal (in out_of_memory.cpp).

#include <cstdlib>

#include "foundation/heap_allocation.h"
#include "vynutil/heap.h"
#include "win32/crt_heap.h"
#include "win32/process.h"

void* VYN_new(std::size_t size) { return vyn::AllocateOrThrow(size); }
void VYN_delete(void* block) noexcept { std::free(block); }
void* VYN_new_array(std::size_t size) { return vyn::AllocateOrThrow(size); }
void VYN_delete_array(void* block) noexcept { std::free(block); }

void* VYN_aligned_malloc(std::size_t size, std::size_t alignment) noexcept {
  return win32::_aligned_malloc(size, alignment);
}
void* VYN_aligned_realloc(void* block, std::size_t size, std::size_t alignment) noexcept {
  return win32::_aligned_realloc(block, size, alignment);
}
void VYN_aligned_free(void* block) noexcept { win32::_aligned_free(block); }

void* UtilAllocateMemory(std::size_t size) noexcept { return std::malloc(size); }
void UtilDeallocateMemory(void* block) noexcept { std::free(block); }

void VYN_CrtDbgBreak() noexcept { win32::DebugBreak(); }
