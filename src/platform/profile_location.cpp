// Profile file names: mapped paths, and bare names in the Windows folder.

#include "profile_location.h"

#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

#include <optional>

#include "syscalls.h"
#include "utf_strings.h"
#include "win32/environment.h"
#include "win32/path_map.h"

namespace win32::detail {

namespace {

constexpr std::u16string_view kDefaultProfile = u"win.ini";
constexpr mode_t kFolderPermissions = 0777;  // less the umask

bool HasFolder(std::u16string_view name) {
  return name.find_first_of(u"\\/") != std::u16string_view::npos ||
         (name.size() >= 2 && name[1] == u':');
}

std::string HomeFolder() {
  if (std::optional<std::string> home = EnvironmentValue("HOME"); home && !home->empty()) {
    return *home;
  }
  passwd entry{};
  passwd* found = nullptr;
  char buffer[4096];
  if (getpwuid_r(getuid(), &entry, buffer, sizeof(buffer), &found) == 0 && found != nullptr &&
      found->pw_dir != nullptr) {
    return found->pw_dir;
  }
  return "/tmp";
}

}  // namespace

std::string WindowsFolder() {
  if (std::optional<std::string> set = EnvironmentValue("TAVLO_PLATFORM_WINDIR");
      set && !set->empty()) {
    return *set;
  }
  // The XDG base-directory rules ignore a relative XDG_CONFIG_HOME.
  std::optional<std::string> config = EnvironmentValue("XDG_CONFIG_HOME");
  if (!config || config->empty() || config->front() != '/') config = HomeFolder() + "/.config";
  return *config + "/vynutil/windows";
}

ProfileLocation LocateProfile(const MCHAR* fileName) {
  ProfileLocation location;
  const std::u16string_view name = fileName != nullptr ? std::u16string_view(fileName)
                                                       : kDefaultProfile;
  if (HasFolder(name)) {
    location.path = MapPath(fileName);
    return location;
  }
  location.inWindowsFolder = true;
  location.path = WindowsFolder() + "/" + Utf8Of(name);
  return location;
}

void CreateWindowsFolder() {
  const std::string folder = WindowsFolder();
  const sys::SyscallTable& calls = sys::Syscalls();
  struct stat info {};
  if (calls.stat(folder.c_str(), &info) == 0) return;
  for (std::size_t slash = folder.find('/', 1);; slash = folder.find('/', slash + 1)) {
    const std::string part = folder.substr(0, slash);
    calls.mkdir(part.c_str(), kFolderPermissions);
    if (slash == std::string::npos) return;
  }
}

}  // namespace win32::detail
