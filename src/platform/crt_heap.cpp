// The runtime heap services around malloc: in-place resizing, block sizes, heap checks, the new
// handler and mode, and aligned blocks, all on glibc's heap.

#include "win32/crt_heap.h"

#include <malloc.h>

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <cstdint>
#include <cstdlib>
#include <cstring>

namespace win32 {

namespace {

std::atomic<_PNH> g_newHandler{nullptr};
std::atomic<int> g_newMode{0};

bool IsPowerOfTwo(std::size_t value) { return value != 0 && (value & (value - 1)) == 0; }

bool IsAligned(const void* block, std::size_t alignment) {
  return reinterpret_cast<std::uintptr_t>(block) % alignment == 0;
}

}  // namespace

void* _expand(void* block, std::size_t size) noexcept {
  if (block == nullptr) {
    errno = EINVAL;
    return nullptr;
  }
  // glibc cannot grow a block in place on request; what it can promise is the room it already
  // gave the block.
  if (size <= malloc_usable_size(block)) return block;
  errno = ENOMEM;
  return nullptr;
}

std::size_t _msize(void* block) noexcept {
  if (block == nullptr) {
    errno = EINVAL;
    return static_cast<std::size_t>(-1);
  }
  return malloc_usable_size(block);
}

int _heapchk() noexcept { return _HEAPOK; }

int _heapmin() noexcept {
  malloc_trim(0);
  return 0;
}

int _heapwalk(_HEAPINFO* entry) noexcept {
  if (entry == nullptr) {
    errno = EINVAL;
    return _HEAPBADPTR;
  }
  return _HEAPEND;
}

int _query_new_mode() noexcept { return g_newMode.load(); }

int _set_new_mode(int mode) noexcept {
  if (mode != 0 && mode != 1) {
    errno = EINVAL;
    return -1;
  }
  return g_newMode.exchange(mode);
}

_PNH _query_new_handler() noexcept { return g_newHandler.load(); }

_PNH _set_new_handler(_PNH handler) noexcept { return g_newHandler.exchange(handler); }

int _callnewh(std::size_t size) {
  const _PNH handler = g_newHandler.load();
  return handler != nullptr && handler(size) != 0 ? 1 : 0;
}

void* _aligned_malloc(std::size_t size, std::size_t alignment) noexcept {
  if (!IsPowerOfTwo(alignment)) {
    errno = EINVAL;
    return nullptr;
  }
  void* block = nullptr;
  const int rc =
      posix_memalign(&block, std::max(alignment, sizeof(void*)), std::max<std::size_t>(size, 1));
  if (rc != 0) {
    errno = rc;
    return nullptr;
  }
  return block;
}

void* _aligned_realloc(void* block, std::size_t size, std::size_t alignment) noexcept {
  if (block == nullptr) return _aligned_malloc(size, alignment);
  if (size == 0) {
    _aligned_free(block);
    return nullptr;
  }
  if (!IsPowerOfTwo(alignment)) {
    errno = EINVAL;
    return nullptr;
  }
  const std::size_t room = malloc_usable_size(block);
  if (size <= room && IsAligned(block, std::max(alignment, sizeof(void*)))) return block;
  void* moved = _aligned_malloc(size, alignment);
  if (moved == nullptr) return nullptr;
  std::memcpy(moved, block, std::min(room, size));
  std::free(block);
  return moved;
}

void _aligned_free(void* block) noexcept { std::free(block); }

}  // namespace win32
