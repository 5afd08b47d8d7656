// Mutex handles and the per-thread memory of recently used ones.

#include "mutex_handle.h"

#include <array>
#include <cstdint>
#include <utility>

#include "mutex_lingering.h"

namespace win32::detail {

namespace {

// The last handles a thread registered or looked up, by handle value. A weak reference: a handle
// closed since is found dead (handle values are never reused, so a value cannot come to mean
// another object).
struct RecentHandle {
  HANDLE handle = nullptr;
  std::weak_ptr<MutexHandle> mutex;
};

thread_local std::array<RecentHandle, 4> t_recent;

RecentHandle& SlotOf(HANDLE handle) {
  return t_recent[(reinterpret_cast<std::uintptr_t>(handle) >> 2) % t_recent.size()];
}

}  // namespace

MutexHandle::~MutexHandle() {
  ReleaseUnownedMutexes();
  if (named_ != nullptr) {
    RemoveNamedMutexHandle(named_);
    return;
  }
  MutexState* unnamed = state_;
  ReleaseWhenUnowned(unnamed, [unnamed] {
    pthread_mutex_destroy(&unnamed->mutex);
    delete unnamed;
  });
}

HANDLE RegisterMutexHandle(std::shared_ptr<MutexHandle> mutex) {
  std::weak_ptr<MutexHandle> remembered = mutex;
  const HANDLE handle = RegisterHandle(std::move(mutex));
  RecentHandle& slot = SlotOf(handle);
  slot.handle = handle;
  slot.mutex = std::move(remembered);
  return handle;
}

std::shared_ptr<MutexHandle> FindMutexHandle(HANDLE handle) {
  RecentHandle& slot = SlotOf(handle);
  if (slot.handle == handle && handle != nullptr) {
    if (std::shared_ptr<MutexHandle> mutex = slot.mutex.lock()) return mutex;
  }
  std::shared_ptr<MutexHandle> mutex = FindHandleOf<MutexHandle>(handle);
  if (mutex != nullptr) {
    slot.handle = handle;
    slot.mutex = mutex;
  }
  return mutex;
}

}  // namespace win32::detail
