// The Windows-only attributes of paths: overrides kept in the process, and the extended
// attribute "user.vyn.attributes".

#include <cstdlib>
#include <filesystem>
#include <map>
#include <mutex>

#include "file_info.h"
#include "module_search.h"
#include "syscalls.h"
#include "win32/file_attributes.h"
#include "win32/path_map.h"

namespace win32::detail {

namespace {

constexpr const char* kAttributeXattr = "user.vyn.attributes";

struct Overrides {
  std::mutex lock;
  std::map<std::string, DWORD> byPath;
};

Overrides& Table() {
  static Overrides* table = new Overrides;
  return *table;
}

// One spelling per path: absolute, without "." and ".." components, doubled or final slashes.
std::string KeyOf(const std::string& posixPath) {
  std::string key = std::filesystem::path(AbsolutePath(posixPath)).lexically_normal().string();
  while (key.size() > 1 && key.back() == '/') key.pop_back();
  return key;
}

DWORD FromExtendedAttribute(const std::string& posixPath) {
  char text[32];
  const ssize_t length =
      sys::Syscalls().lgetxattr(posixPath.c_str(), kAttributeXattr, text, sizeof text - 1);
  if (length <= 0) return 0;
  text[length] = 0;
  char* end = nullptr;
  const unsigned long value = std::strtoul(text, &end, 0);
  return end != text ? static_cast<DWORD>(value) & kExtraAttributeMask : 0;
}

}  // namespace

DWORD ExtraAttributesOf(const std::string& posixPath) {
  {
    Overrides& table = Table();
    std::lock_guard<std::mutex> lock(table.lock);
    if (!table.byPath.empty()) {
      auto found = table.byPath.find(KeyOf(posixPath));
      if (found != table.byPath.end()) return found->second;
    }
  }
  return FromExtendedAttribute(posixPath);
}

void SetExtraAttributesOf(const std::string& posixPath, DWORD attributes) {
  attributes &= kExtraAttributeMask;
  Overrides& table = Table();
  std::lock_guard<std::mutex> lock(table.lock);
  if (attributes == 0) {
    table.byPath.erase(KeyOf(posixPath));
  } else {
    table.byPath[KeyOf(posixPath)] = attributes;
  }
}

void SetExtraFileAttributes(LPCWSTR path, DWORD attributes) {
  if (path != nullptr) SetExtraAttributesOf(MapPath(path), attributes);
}

void ClearExtraFileAttributes() {
  Overrides& table = Table();
  std::lock_guard<std::mutex> lock(table.lock);
  table.byPath.clear();
}

}  // namespace win32::detail
