// Global memory blocks. Every live block is recorded, so that a handle the layer did not hand out
// (or already took back) is refused with ERROR_INVALID_HANDLE instead of being freed or read.
// A fixed block's handle is its address; a movable block's handle is the address of its record,
// which can never be the address of a live fixed block.

#include "win32/global_memory.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <mutex>
#include <unordered_map>

#include "win32/last_error.h"

namespace win32 {

namespace {

// The bytes of one block: its size as the caller asked for it, and room for growing in place.
struct Bytes {
  void* data = nullptr;
  SIZE_T size = 0;
  SIZE_T capacity = 0;
};

struct MovableBlock {
  Bytes bytes;
  UINT locks = 0;
};

struct BlockRegistry {
  std::mutex lock;
  std::unordered_map<void*, Bytes> fixed;                            // by address
  std::unordered_map<void*, std::unique_ptr<MovableBlock>> movable;  // by handle
};

// Never destroyed: blocks may be freed by static destructors of other modules at exit.
BlockRegistry& Registry() {
  static BlockRegistry* registry = new BlockRegistry;
  return *registry;
}

bool Allocate(Bytes& bytes, SIZE_T size, bool zero) {
  const SIZE_T capacity = std::max<SIZE_T>(size, 1);
  void* data = zero ? std::calloc(capacity, 1) : std::malloc(capacity);
  if (data == nullptr) return false;
  bytes = {data, size, capacity};
  return true;
}

// Resizes bytes; moves them only when allowed. False (bytes unchanged) when they cannot be had.
bool Resize(Bytes& bytes, SIZE_T size, bool zero, bool mayMove) {
  if (size > bytes.capacity) {
    if (!mayMove) return false;
    void* data = std::realloc(bytes.data, size);
    if (data == nullptr) return false;
    bytes.data = data;
    bytes.capacity = size;
  }
  if (zero && size > bytes.size) {
    std::memset(static_cast<char*>(bytes.data) + bytes.size, 0, size - bytes.size);
  }
  bytes.size = size;
  return true;
}

template <typename Result>
Result Fail(DWORD error, Result result) {
  SetLastError(error);
  return result;
}

HGLOBAL ReAllocFixed(BlockRegistry& registry, HGLOBAL block, SIZE_T size, UINT flags) {
  auto found = registry.fixed.find(block);
  Bytes bytes = found->second;
  if (!Resize(bytes, size, (flags & GMEM_ZEROINIT) != 0, (flags & GMEM_MOVEABLE) != 0)) {
    return Fail<HGLOBAL>(ERROR_NOT_ENOUGH_MEMORY, nullptr);
  }
  registry.fixed.erase(found);
  registry.fixed.emplace(bytes.data, bytes);
  return bytes.data;
}

HGLOBAL ReAllocMovable(MovableBlock& movable, HGLOBAL block, SIZE_T size, UINT flags) {
  Bytes& bytes = movable.bytes;
  if (size == 0 && movable.locks == 0) {  // discarded: the handle stays, the bytes go
    std::free(bytes.data);
    bytes = {};
    return block;
  }
  const bool zero = (flags & GMEM_ZEROINIT) != 0;
  const bool mayMove = movable.locks == 0 || (flags & GMEM_MOVEABLE) != 0;
  if (bytes.data == nullptr ? !Allocate(bytes, size, zero) : !Resize(bytes, size, zero, mayMove)) {
    return Fail<HGLOBAL>(ERROR_NOT_ENOUGH_MEMORY, nullptr);
  }
  return block;
}

}  // namespace

HGLOBAL GlobalAlloc(UINT flags, SIZE_T bytes) {
  const bool zero = (flags & GMEM_ZEROINIT) != 0;
  BlockRegistry& registry = Registry();
  if ((flags & GMEM_MOVEABLE) == 0) {
    Bytes block;
    if (!Allocate(block, bytes, zero)) return Fail<HGLOBAL>(ERROR_NOT_ENOUGH_MEMORY, nullptr);
    std::lock_guard<std::mutex> lock(registry.lock);
    registry.fixed.emplace(block.data, block);
    return block.data;
  }
  auto movable = std::make_unique<MovableBlock>();
  if (bytes > 0 && !Allocate(movable->bytes, bytes, zero)) {
    return Fail<HGLOBAL>(ERROR_NOT_ENOUGH_MEMORY, nullptr);
  }
  HGLOBAL handle = movable.get();
  std::lock_guard<std::mutex> lock(registry.lock);
  registry.movable.emplace(handle, std::move(movable));
  return handle;
}

HGLOBAL GlobalReAlloc(HGLOBAL block, SIZE_T bytes, UINT flags) {
  BlockRegistry& registry = Registry();
  std::lock_guard<std::mutex> lock(registry.lock);
  if (registry.fixed.count(block) != 0) return ReAllocFixed(registry, block, bytes, flags);
  auto movable = registry.movable.find(block);
  if (movable == registry.movable.end()) return Fail<HGLOBAL>(ERROR_INVALID_HANDLE, nullptr);
  return ReAllocMovable(*movable->second, block, bytes, flags);
}

void* GlobalLock(HGLOBAL block) {
  BlockRegistry& registry = Registry();
  std::lock_guard<std::mutex> lock(registry.lock);
  if (registry.fixed.count(block) != 0) return block;
  auto movable = registry.movable.find(block);
  if (movable == registry.movable.end()) return Fail<void*>(ERROR_INVALID_HANDLE, nullptr);
  MovableBlock& found = *movable->second;
  if (found.bytes.data == nullptr) return Fail<void*>(ERROR_DISCARDED, nullptr);
  ++found.locks;
  return found.bytes.data;
}

BOOL GlobalUnlock(HGLOBAL block) {
  BlockRegistry& registry = Registry();
  std::lock_guard<std::mutex> lock(registry.lock);
  if (registry.fixed.count(block) != 0) return TRUE;
  auto movable = registry.movable.find(block);
  if (movable == registry.movable.end()) return Fail<BOOL>(ERROR_INVALID_HANDLE, FALSE);
  MovableBlock& found = *movable->second;
  if (found.locks == 0) return Fail<BOOL>(ERROR_NOT_LOCKED, FALSE);
  if (--found.locks == 0) return Fail<BOOL>(ERROR_SUCCESS, FALSE);
  return TRUE;
}

HGLOBAL GlobalFree(HGLOBAL block) {
  if (block == nullptr) return nullptr;
  BlockRegistry& registry = Registry();
  std::unique_ptr<MovableBlock> movable;
  {
    std::lock_guard<std::mutex> lock(registry.lock);
    if (registry.fixed.erase(block) != 0) {
      std::free(block);
      return nullptr;
    }
    auto found = registry.movable.find(block);
    if (found == registry.movable.end()) return Fail<HGLOBAL>(ERROR_INVALID_HANDLE, block);
    movable = std::move(found->second);
    registry.movable.erase(found);
  }
  std::free(movable->bytes.data);
  return nullptr;
}

SIZE_T GlobalSize(HGLOBAL block) {
  if (block == nullptr) return 0;
  BlockRegistry& registry = Registry();
  std::lock_guard<std::mutex> lock(registry.lock);
  auto fixed = registry.fixed.find(block);
  if (fixed != registry.fixed.end()) return fixed->second.size;
  auto movable = registry.movable.find(block);
  if (movable == registry.movable.end()) return Fail<SIZE_T>(ERROR_INVALID_HANDLE, 0);
  return movable->second->bytes.size;
}

}  // namespace win32
