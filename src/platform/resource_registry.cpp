// Registration of module resource tables. A module registers while its static objects are built
// (VYN_MODULE_RESOURCES) and withdraws when they are destroyed; lookups may come from any thread.

#include "resource_registry.h"

#include <functional>
#include <mutex>
#include <new>
#include <unordered_map>

#include "win32/module.h"

namespace win32::detail {

namespace {

struct Registry {
  std::mutex lock;
  std::unordered_map<HMODULE, const VynModuleResources*> tables;
};

// Never destroyed: modules withdraw their tables from their own static destructors, which may run
// after this library's.
Registry& Tables() {
  static Registry* registry = new Registry;
  return *registry;
}

bool Contains(const VynModuleResources& resources, const VynDataResource* entry) {
  const std::less<const VynDataResource*> before;
  for (std::size_t i = 0; i < resources.languageCount; ++i) {
    const VynResourceLanguage& language = resources.languages[i];
    if (language.dataCount == 0) continue;
    if (!before(entry, language.data) && before(entry, language.data + language.dataCount)) {
      return true;
    }
  }
  return false;
}

}  // namespace

const VynModuleResources* ResourcesOf(HMODULE module) {
  Registry& registry = Tables();
  std::lock_guard<std::mutex> lock(registry.lock);
  auto found = registry.tables.find(module);
  return found != registry.tables.end() ? found->second : nullptr;
}

bool IsRegisteredDataResource(const VynDataResource* entry) {
  Registry& registry = Tables();
  std::lock_guard<std::mutex> lock(registry.lock);
  for (const auto& [module, resources] : registry.tables) {
    if (Contains(*resources, entry)) return true;
  }
  return false;
}

}  // namespace win32::detail

void VynRegisterModuleResources(const VynModuleResources* resources) noexcept {
  if (resources == nullptr) return;
  HMODULE module = win32::detail::ModuleOfAddress(resources);
  if (module == nullptr) return;
  win32::detail::Registry& registry = win32::detail::Tables();
  std::lock_guard<std::mutex> lock(registry.lock);
  try {
    registry.tables[module] = resources;
  } catch (const std::bad_alloc&) {
    // Without memory for the entry the module simply has no resources.
  }
}

void VynUnregisterModuleResources(const VynModuleResources* resources) noexcept {
  if (resources == nullptr) return;
  win32::detail::Registry& registry = win32::detail::Tables();
  std::lock_guard<std::mutex> lock(registry.lock);
  // Found by the tables themselves: a later registration of the same module stays.
  for (auto entry = registry.tables.begin(); entry != registry.tables.end(); ++entry) {
    if (entry->second == resources) {
      registry.tables.erase(entry);
      return;
    }
  }
}
