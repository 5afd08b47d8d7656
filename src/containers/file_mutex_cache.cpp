// The per-process cache of open file mutexes.

#include "containers/file_mutex_cache.h"

#include <mutex>
#include <unordered_map>
#include <unordered_set>

#include "win32/sync.h"

namespace vyn::containers {

namespace {

// More distinct files than this are locked by opening and closing their mutexes each time.
constexpr std::size_t kMostKept = 512;

struct Cache {
  std::mutex lock;
  std::unordered_map<std::u16string, HANDLE> handles;
  std::unordered_set<HANDLE> kept;
};

// Never destroyed: file mutexes are taken from static destructors too.
Cache& Mutexes() {
  static Cache* cache = new Cache;
  return *cache;
}

}  // namespace

HANDLE OpenFileMutex(const std::u16string& name, bool& kept) {
  Cache& cache = Mutexes();
  std::lock_guard<std::mutex> hold(cache.lock);
  const auto found = cache.handles.find(name);
  if (found != cache.handles.end()) {
    kept = true;
    return found->second;
  }
  const HANDLE handle = win32::CreateMutexW(nullptr, FALSE, name.c_str());
  kept = handle != nullptr && cache.handles.size() < kMostKept;
  if (kept) {
    cache.handles.emplace(name, handle);
    cache.kept.insert(handle);
  }
  return handle;
}

void CloseFileMutex(HANDLE handle) {
  Cache& cache = Mutexes();
  {
    std::lock_guard<std::mutex> hold(cache.lock);
    if (cache.kept.count(handle) != 0) return;
  }
  win32::CloseHandle(handle);
}

}  // namespace vyn::containers
