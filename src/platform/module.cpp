// Modules: LoadLibraryW and its family over the dynamic loader. A module's handle is the
// loader's handle (its link map), so a handle from dlopen, from GetModuleHandleW and from an
// address inside the module are all the same value.

#include "win32/module.h"

#include <dlfcn.h>

#include <cstring>
#include <string>

#include "loaded_modules.h"
#include "module_names.h"
#include "module_search.h"
#include "syscalls.h"
#include "utf_strings.h"
#include "win32/last_error.h"
#include "win32/path_map.h"
#include "win32/resource.h"

namespace win32 {

namespace {

constexpr int kLoadFlags = RTLD_NOW | RTLD_LOCAL;

template <typename Result>
Result Fail(DWORD error, Result result) {
  SetLastError(error);
  return result;
}

// The loaded module a name or path refers to, by Windows' rules: a bare name matches the file
// name of a loaded module, a path matches its whole path; both without regard to case.
bool FindLoadedByName(const std::u16string& name, detail::LoadedModule& found) {
  const bool isPath = detail::HasFolderPart(name);
  const std::u16string wanted =
      isPath ? detail::Utf16Of(detail::AbsolutePath(MapPath(name.c_str()))) : name;
  for (detail::LoadedModule& module : detail::LoadedModules()) {
    const std::string_view compared = isPath ? module.path : detail::BaseName(module.path);
    if (detail::SameModuleName(detail::Utf16Of(compared), wanted)) {
      found = std::move(module);
      return true;
    }
  }
  return false;
}

// Loads the module at path (absolute) or, for the main program, the program itself.
HMODULE Open(const std::string& path, bool mainProgram) {
  return static_cast<HMODULE>(
      sys::Syscalls().dlopen(mainProgram ? nullptr : path.c_str(), kLoadFlags));
}

HMODULE LoadByPath(const std::u16string& name) {
  const std::string mapped = detail::AbsolutePath(MapPath(name.c_str()));
  const std::size_t slash = mapped.rfind('/');
  const std::optional<std::string> file =
      detail::FindInFolder(mapped.substr(0, slash == 0 ? 1 : slash), mapped.substr(slash + 1));
  if (!file) return Fail<HMODULE>(ERROR_MOD_NOT_FOUND, nullptr);
  HMODULE module = Open(*file, false);
  return module != nullptr ? module : Fail<HMODULE>(ERROR_DLL_INIT_FAILED, nullptr);
}

HMODULE LoadBySearch(const std::u16string& name) {
  detail::LoadedModule loaded;
  if (FindLoadedByName(name, loaded)) {
    HMODULE module = Open(loaded.path, loaded.handle == detail::MainProgram());
    if (module != nullptr) return module;
  }
  HMODULE module = nullptr;
  bool unloadable = false;  // a file of that name was found but could not be loaded
  auto openFile = [&](const std::string& path) {
    module = Open(path, false);
    unloadable = unloadable || module == nullptr;
    return module != nullptr;
  };
  auto openBySystem = [&](const std::string& bareName) {
    module = static_cast<HMODULE>(sys::Syscalls().dlopen(bareName.c_str(), kLoadFlags));
    return module != nullptr;
  };
  if (detail::SearchModule(detail::Utf8Of(name), openFile, openBySystem)) return module;
  return Fail<HMODULE>(unloadable ? ERROR_DLL_INIT_FAILED : ERROR_MOD_NOT_FOUND, nullptr);
}

}  // namespace

HMODULE LoadLibraryW(const MCHAR* fileName) {
  if (fileName == nullptr) return Fail<HMODULE>(ERROR_INVALID_PARAMETER, nullptr);
  if (fileName[0] == 0) return Fail<HMODULE>(ERROR_MOD_NOT_FOUND, nullptr);
  const std::u16string name = detail::WithDefaultExtension(fileName);
  return detail::HasFolderPart(name) ? LoadByPath(name) : LoadBySearch(name);
}

HMODULE LoadLibraryExW(const MCHAR* fileName, HANDLE hFile, DWORD dwFlags) {
  if (hFile != nullptr || dwFlags != 0) return Fail<HMODULE>(ERROR_INVALID_PARAMETER, nullptr);
  return LoadLibraryW(fileName);
}

BOOL FreeLibrary(HMODULE module) {
  detail::LoadedModule loaded;
  if (!detail::FindLoadedModule(module, loaded)) return Fail<BOOL>(ERROR_MOD_NOT_FOUND, FALSE);
  // The loader refuses to give up more loads than were counted.
  if (sys::Syscalls().dlclose(module) != 0) return Fail<BOOL>(ERROR_INVALID_HANDLE, FALSE);
  return TRUE;
}

HMODULE GetModuleHandleW(const MCHAR* moduleName) {
  if (moduleName == nullptr) return detail::MainProgram();
  detail::LoadedModule loaded;
  if (moduleName[0] == 0 || !FindLoadedByName(detail::WithDefaultExtension(moduleName), loaded)) {
    return Fail<HMODULE>(ERROR_MOD_NOT_FOUND, nullptr);
  }
  return loaded.handle;
}

FARPROC GetProcAddress(HMODULE module, const char* name) {
  const HMODULE program = detail::MainProgram();
  if (module == nullptr) module = program;
  detail::LoadedModule loaded;
  if (!detail::FindLoadedModule(module, loaded)) return Fail<FARPROC>(ERROR_MOD_NOT_FOUND, nullptr);
  if (name == nullptr || IS_INTRESOURCE(name)) return Fail<FARPROC>(ERROR_PROC_NOT_FOUND, nullptr);
  // dlsym needs a handle from dlopen: a module loaded as another's dependency has none of its
  // own until it is opened (without loading anything) here.
  const sys::SyscallTable& calls = sys::Syscalls();
  void* handle =
      calls.dlopen(module == program ? nullptr : loaded.path.c_str(), RTLD_LAZY | RTLD_NOLOAD);
  if (handle == nullptr) return Fail<FARPROC>(ERROR_MOD_NOT_FOUND, nullptr);
  void* symbol = calls.dlsym(handle, name);
  calls.dlclose(handle);
  // dlsym also searches the module's dependencies; Windows looks at the module's own exports.
  if (symbol == nullptr || detail::ModuleOfAddress(symbol) != module) {
    return Fail<FARPROC>(ERROR_PROC_NOT_FOUND, nullptr);
  }
  return reinterpret_cast<FARPROC>(symbol);
}

DWORD GetModuleFileNameW(HMODULE module, MCHAR* buffer, DWORD size) {
  if (buffer == nullptr && size != 0) return Fail<DWORD>(ERROR_INVALID_PARAMETER, 0);
  if (module == nullptr) module = detail::MainProgram();
  detail::LoadedModule loaded;
  if (!detail::FindLoadedModule(module, loaded)) return Fail<DWORD>(ERROR_MOD_NOT_FOUND, 0);
  const std::u16string path = detail::Utf16Of(loaded.path);
  if (path.size() >= size) {
    if (size == 0) return Fail<DWORD>(ERROR_INSUFFICIENT_BUFFER, 0);
    std::memcpy(buffer, path.data(), (size - 1) * sizeof(MCHAR));
    buffer[size - 1] = 0;
    return Fail<DWORD>(ERROR_INSUFFICIENT_BUFFER, size);
  }
  std::memcpy(buffer, path.data(), path.size() * sizeof(MCHAR));
  buffer[path.size()] = 0;
  return static_cast<DWORD>(path.size());
}

}  // namespace win32
