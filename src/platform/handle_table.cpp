// The registry of live handles, and CloseHandle over it.

#include "handle_table.h"

#include <cstdint>
#include <mutex>
#include <unordered_map>
#include <utility>

#include "win32/handles.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {

struct Registry {
  std::mutex lock;
  std::uintptr_t next = 0x10000;
  std::unordered_map<std::uintptr_t, std::shared_ptr<HandleObject>> objects;
};

// Never destroyed: handles may be closed from static destructors of other objects.
Registry& Handles() {
  static Registry* registry = new Registry;
  return *registry;
}

}  // namespace

HANDLE RegisterHandle(std::shared_ptr<HandleObject> object) {
  Registry& registry = Handles();
  std::lock_guard<std::mutex> lock(registry.lock);
  const std::uintptr_t value = registry.next;
  registry.next += 4;
  registry.objects.emplace(value, std::move(object));
  return reinterpret_cast<HANDLE>(value);
}

std::shared_ptr<HandleObject> FindHandle(HANDLE handle) {
  Registry& registry = Handles();
  std::lock_guard<std::mutex> lock(registry.lock);
  auto found = registry.objects.find(reinterpret_cast<std::uintptr_t>(handle));
  return found != registry.objects.end() ? found->second : nullptr;
}

std::shared_ptr<HandleObject> TakeHandle(HANDLE handle, bool (*accept)(const HandleObject&)) {
  std::shared_ptr<HandleObject> taken;
  Registry& registry = Handles();
  std::lock_guard<std::mutex> lock(registry.lock);
  auto found = registry.objects.find(reinterpret_cast<std::uintptr_t>(handle));
  if (found == registry.objects.end() || !accept(*found->second)) return nullptr;
  taken = std::move(found->second);
  registry.objects.erase(found);
  return taken;
}

}  // namespace win32::detail

namespace win32 {

BOOL CloseHandle(HANDLE object) {
  // The object is released outside the registry's lock: closing a file may delete it.
  std::shared_ptr<detail::KernelObject> closed = detail::TakeHandleOf<detail::KernelObject>(object);
  if (closed == nullptr) {
    SetLastError(ERROR_INVALID_HANDLE);
    return FALSE;
  }
  closed.reset();
  return TRUE;
}

}  // namespace win32
