// Loaded modules from dl_iterate_phdr. The loader's handle of a module (its link map) comes from
// dladdr1 on an address inside the module; it is asked after the walk, because dladdr1 takes a
// loader lock that dl_iterate_phdr must not hold when another thread is loading.

#include "loaded_modules.h"

#include <dlfcn.h>
#include <link.h>

#include <string_view>

#include "syscalls.h"
#include "win32/module.h"

namespace win32::detail {

namespace {

struct Sighting {
  const void* address;  // the start of the module's first loaded segment
  std::string name;     // as the loader knows it; empty for the main program
};

int AddSighting(dl_phdr_info* info, size_t, void* out) {
  for (ElfW(Half) i = 0; i < info->dlpi_phnum; ++i) {
    const ElfW(Phdr)& segment = info->dlpi_phdr[i];
    if (segment.p_type != PT_LOAD || segment.p_memsz == 0) continue;
    const auto address = reinterpret_cast<const void*>(info->dlpi_addr + segment.p_vaddr);
    static_cast<std::vector<Sighting>*>(out)->push_back(
        {address, info->dlpi_name != nullptr ? info->dlpi_name : ""});
    break;
  }
  return 0;
}

}  // namespace

std::string ProgramPath() {
  std::string path(256, '\0');
  for (;;) {
    const ssize_t length = sys::Syscalls().readlink("/proc/self/exe", path.data(), path.size());
    if (length < 0) return {};
    if (static_cast<std::size_t>(length) < path.size()) {
      path.resize(static_cast<std::size_t>(length));
      return path;
    }
    path.resize(path.size() * 2);
  }
}

HMODULE MainProgram() {
  // The main program's handle is the same link map every time; taking it counts a load, so give
  // that load back at once.
  void* handle = sys::Syscalls().dlopen(nullptr, RTLD_LAZY);
  if (handle != nullptr) sys::Syscalls().dlclose(handle);
  return static_cast<HMODULE>(handle);
}

std::vector<LoadedModule> LoadedModules() {
  std::vector<Sighting> sightings;
  dl_iterate_phdr(AddSighting, &sightings);
  std::vector<LoadedModule> modules;
  modules.reserve(sightings.size());
  for (Sighting& sighting : sightings) {
    HMODULE handle = ModuleOfAddress(sighting.address);
    if (handle == nullptr) continue;
    std::string path = sighting.name.empty() ? ProgramPath() : std::move(sighting.name);
    modules.push_back({handle, std::move(path)});
  }
  return modules;
}

bool FindLoadedModule(HMODULE handle, LoadedModule& found) {
  if (handle == nullptr) return false;
  for (LoadedModule& module : LoadedModules()) {
    if (module.handle == handle) {
      found = std::move(module);
      return true;
    }
  }
  return false;
}

HMODULE ModuleOfAddress(const void* address) noexcept {
  if (address == nullptr) return nullptr;
  Dl_info info{};
  void* linkMap = nullptr;
  if (dladdr1(address, &info, &linkMap, RTLD_DL_LINKMAP) == 0) return nullptr;
  return static_cast<HMODULE>(linkMap);
}

}  // namespace win32::detail
