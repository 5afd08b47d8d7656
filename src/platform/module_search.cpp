// The search order for modules named without a folder.

#include "module_search.h"

#include <dirent.h>
#include <sys/stat.h>

#include <cerrno>
#include <string_view>
#include <vector>

#include "loaded_modules.h"
#include "module_names.h"
#include "syscalls.h"
#include "utf_strings.h"
#include "win32/environment.h"

namespace win32::detail {

namespace {

std::string Join(const std::string& folder, const std::string& name) {
  if (folder.empty() || folder.back() == '/') return folder + name;
  return folder + '/' + name;
}

bool IsFile(const std::string& path) {
  struct stat info {};
  return sys::Syscalls().stat(path.c_str(), &info) == 0 && S_ISREG(info.st_mode);
}

std::string CurrentFolder() {
  std::string folder(256, '\0');
  for (;;) {
    if (sys::Syscalls().getcwd(folder.data(), folder.size()) != nullptr) {
      folder.resize(folder.find('\0'));
      return folder;
    }
    if (errno != ERANGE) return {};
    folder.resize(folder.size() * 2);
  }
}

std::string ProgramFolder() {
  const std::string program = ProgramPath();
  const std::size_t slash = program.rfind('/');
  return slash == std::string::npos ? std::string() : program.substr(0, slash);
}

// The folders of PATH, in order; empty entries are left out.
std::vector<std::string> PathFolders() {
  std::vector<std::string> folders;
  const std::optional<std::string> path = EnvironmentValue("PATH");
  if (!path) return folders;
  std::string_view rest = *path;
  while (!rest.empty()) {
    const std::size_t colon = rest.find(':');
    const std::string_view folder = rest.substr(0, colon);
    if (!folder.empty()) folders.emplace_back(folder);
    if (colon == std::string_view::npos) break;
    rest.remove_prefix(colon + 1);
  }
  return folders;
}

}  // namespace

std::optional<std::string> FindInFolder(const std::string& folder, const std::string& name) {
  if (folder.empty()) return std::nullopt;
  const std::string exact = Join(folder, name);
  if (IsFile(exact)) return exact;
  const sys::SyscallTable& calls = sys::Syscalls();
  DIR* listing = calls.opendir(folder.c_str());
  if (listing == nullptr) return std::nullopt;
  const std::u16string wanted = Utf16Of(name);
  std::optional<std::string> found;
  while (const dirent* entry = calls.readdir(listing)) {
    if (!SameModuleName(Utf16Of(entry->d_name), wanted)) continue;
    const std::string candidate = Join(folder, entry->d_name);
    if (IsFile(candidate)) {
      found = candidate;
      break;
    }
  }
  calls.closedir(listing);
  return found;
}

bool SearchModule(const std::string& name, const std::function<bool(const std::string&)>& found,
                  const std::function<bool(const std::string&)>& trySystem) {
  auto tryFolder = [&](const std::string& folder) {
    const std::optional<std::string> path = FindInFolder(folder, name);
    return path && found(*path);
  };
  if (tryFolder(ProgramFolder()) || trySystem(name) || tryFolder(CurrentFolder())) return true;
  for (const std::string& folder : PathFolders()) {
    if (tryFolder(folder)) return true;
  }
  return false;
}

std::string AbsolutePath(const std::string& path) {
  if (!path.empty() && path.front() == '/') return path;
  return Join(CurrentFolder(), path);
}

}  // namespace win32::detail
