// VynHeapOperators: the class-level operators every exported SDK class inherits. Each is a direct
// forward to the shared heap's allocation behaviours; no header, no bookkeeping.

#include <cstdlib>

#include "foundation/heap_allocation.h"
#include "vynutil/heap.h"
#include "win32/crt_heap.h"

using vyn::AllocateAlignedOrNull;
using vyn::AllocateAlignedOrThrow;
using vyn::AllocateOrNull;
using vyn::AllocateOrThrow;

void* VynHeapOperators::operator new(std::size_t size) { return AllocateOrThrow(size); }
void* VynHeapOperators::operator new(std::size_t size, ULONG) { return AllocateOrThrow(size); }
void* VynHeapOperators::operator new(std::size_t size, int, const char*, int) {
  return AllocateOrThrow(size);
}
void* VynHeapOperators::operator new(std::size_t size, const char* file, int line) {
  return operator new(size, 1, file, line);
}
void* VynHeapOperators::operator new(std::size_t size, const std::nothrow_t&) noexcept {
  return AllocateOrNull(size);
}
void* VynHeapOperators::operator new(std::size_t size, const std::nothrow_t&, ULONG) noexcept {
  return AllocateOrNull(size);
}
void* VynHeapOperators::operator new(std::size_t size, const std::nothrow_t&, const char*,
                                     int) noexcept {
  return AllocateOrNull(size);
}
void* VynHeapOperators::operator new(std::size_t, void* where) noexcept { return where; }

void* VynHeapOperators::operator new[](std::size_t size) { return AllocateOrThrow(size); }
void* VynHeapOperators::operator new[](std::size_t size, ULONG) { return AllocateOrThrow(size); }
void* VynHeapOperators::operator new[](std::size_t size, int, const char*, int) {
  return AllocateOrThrow(size);
}
void* VynHeapOperators::operator new[](std::size_t size, const char* file, int line) {
  return operator new[](size, 1, file, line);
}
void* VynHeapOperators::operator new[](std::size_t size, const std::nothrow_t&) noexcept {
  return AllocateOrNull(size);
}
void* VynHeapOperators::operator new[](std::size_t size, const std::nothrow_t&, ULONG) noexcept {
  return AllocateOrNull(size);
}
void* VynHeapOperators::operator new[](std::size_t size, const std::nothrow_t&, const char*,
                                       int) noexcept {
  return AllocateOrNull(size);
}

void* VynHeapOperators::operator new(std::size_t size, std::align_val_t alignment) {
  return AllocateAlignedOrThrow(size, static_cast<std::size_t>(alignment));
}
void* VynHeapOperators::operator new(std::size_t size, std::align_val_t alignment,
                                     const std::nothrow_t&) noexcept {
  return AllocateAlignedOrNull(size, static_cast<std::size_t>(alignment));
}
void* VynHeapOperators::operator new[](std::size_t size, std::align_val_t alignment) {
  return AllocateAlignedOrThrow(size, static_cast<std::size_t>(alignment));
}
void* VynHeapOperators::operator new[](std::size_t size, std::align_val_t alignment,
                                       const std::nothrow_t&) noexcept {
  return AllocateAlignedOrNull(size, static_cast<std::size_t>(alignment));
}

void VynHeapOperators::operator delete(void* block) noexcept { std::free(block); }
void VynHeapOperators::operator delete(void* block, ULONG) noexcept { std::free(block); }
void VynHeapOperators::operator delete(void* block, int, const char*, int) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete(void* block, const char*, int) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete(void* block, const std::nothrow_t&) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete(void* block, const std::nothrow_t&, ULONG) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete(void* block, const std::nothrow_t&, const char*,
                                       int) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete(void* block, std::align_val_t) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete(void* block, std::align_val_t,
                                       const std::nothrow_t&) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete(void*, void*) noexcept {}

void VynHeapOperators::operator delete[](void* block) noexcept { std::free(block); }
void VynHeapOperators::operator delete[](void* block, ULONG) noexcept { std::free(block); }
void VynHeapOperators::operator delete[](void* block, int, const char*, int) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete[](void* block, const char*, int) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete[](void* block, const std::nothrow_t&) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete[](void* block, const std::nothrow_t&, ULONG) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete[](void* block, const std::nothrow_t&, const char*,
                                         int) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete[](void* block, std::align_val_t) noexcept {
  std::free(block);
}
void VynHeapOperators::operator delete[](void* block, std::align_val_t,
                                         const std::nothrow_t&) noexcept {
  std::free(block);
}

void* VynHeapOperators::aligned_malloc(std::size_t size, std::size_t alignment) noexcept {
  return win32::_aligned_malloc(size, alignment);
}
void* VynHeapOperators::aligned_realloc(void* block, std::size_t size,
                                        std::size_t alignment) noexcept {
  return win32::_aligned_realloc(block, size, alignment);
}
void VynHeapOperators::aligned_free(void* block) noexcept { win32::_aligned_free(block); }
