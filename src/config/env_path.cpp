// Util::EnvPath: folders and folder lists named by environment variables.

#include "vynutil/env_path.h"

#include <map>
#include <mutex>
#include <string>

#include "config/env_reference.h"
#include "win32/environment.h"
#include "win32/file_attributes.h"
#include "win32/last_error.h"
#include "win32/search_path.h"

namespace Util {

namespace {

using VynSDK::Util::Path;

const MCHAR* const kMultiPathNames[] = {
    u"KORV_TAVLO_SCRIPTS_ADDON_DIR", u"KORV_TAVLO_STARTUPSCRIPTS_ADDON_DIR", u"KORV_TAVLO_MACROS_ADDON_DIR",
    u"KORV_TAVLO_ICONS_ADDON_DIR",   u"KORV_TAVLO_PLUGINS_ADDON_DIR",        u"KORV_TAVLO_ASSETS_XREFS_DIR",
    u"KORV_TAVLO_ASSETS_MAPS_DIR",
};
const MCHAR* const kSinglePathNames[] = {
    u"KORV_TAVLO_PROJECT_FOLDER_DIR", u"KORV_TAVLO_USERSETTINGS_DIR", u"KORV_TAVLO_USERTOOLS_DIR",
    u"KORV_TAVLO_APPDATA_DIR",        u"KORV_TAVLO_AUTOBACKUP_DIR",
};
constexpr int kMultiPathCount = sizeof(kMultiPathNames) / sizeof(kMultiPathNames[0]);
constexpr int kSinglePathCount = sizeof(kSinglePathNames) / sizeof(kSinglePathNames[0]);

// Longest single-folder value, in characters without the terminator.
constexpr DWORD kSinglePathLimit = 259;
constexpr DWORD kLocateBuffer = 260;

bool HasReference(const WStr& text) {
  return vyn::config::HasEnvironmentReference(text.data(), static_cast<std::size_t>(text.Length()));
}

// White space as the ECMAScript class \s has it.
bool IsBlankUnit(MCHAR c) {
  return (c >= 0x09 && c <= 0x0D) || c == 0x20 || c == 0xA0 || c == 0x1680 || (c >= 0x2000 && c <= 0x200A) ||
         c == 0x2028 || c == 0x2029 || c == 0x202F || c == 0x205F || c == 0x3000 || c == 0xFEFF;
}

bool IsBlank(const WStr& text) {
  for (int i = 0; i < text.Length(); ++i) {
    if (!IsBlankUnit(text.data()[i])) return false;
  }
  return true;
}

// The folder-list caches: lists computed from a variable's expanded value. Locked, as folder
// lists are asked for from any thread.
struct ListCache {
  std::mutex lock;
  std::map<int, std::vector<Path>> lists;
  std::map<int, std::u16string> texts;
};

ListCache& Cache() {
  static ListCache* cache = new ListCache;
  return *cache;
}

}  // namespace

WStr EnvPath::ExpandEnvVars(const WStr& text) {
  DWORD needed = win32::ExpandEnvironmentStringsW(text.data(), nullptr, 0);
  while (needed != 0) {
    std::u16string out(needed, u'\0');
    const DWORD written = win32::ExpandEnvironmentStringsW(text.data(), out.data(), needed);
    if (written == 0) break;
    if (written <= needed) return WStr(out.c_str());
    needed = written;  // a variable grew in between
  }
  return text;
}

bool EnvPath::GetEnvironmentMSTR(const MCHAR* name, WStr& out, size_t lengthLimit) {
  for (;;) {
    const DWORD size = win32::GetEnvironmentVariableW(name, nullptr, 0);
    if (size == 0) {
      // Unset, or set to the empty text.
      if (win32::GetLastError() == win32::ERROR_ENVVAR_NOT_FOUND) return false;
      out = WStr(u"");
      return true;
    }
    if (lengthLimit != 0 && size > lengthLimit) return false;
    std::u16string value(size, u'\0');
    const DWORD got = win32::GetEnvironmentVariableW(name, value.data(), size);
    if (got == 0 && win32::GetLastError() == win32::ERROR_ENVVAR_NOT_FOUND) return false;  // removed in between
    if (got < size) {
      value.resize(got);
      out = WStr(value.c_str());
      return true;
    }
    // Grew in between: ask again.
  }
}

std::vector<WStr> EnvPath::SplitPath(const MCHAR* text) {
  std::vector<WStr> pieces;
  const std::u16string all(text != nullptr ? text : u"");
  std::size_t start = 0;
  for (;;) {
    const std::size_t end = all.find(u';', start);
    pieces.emplace_back(all.substr(start, end == std::u16string::npos ? std::u16string::npos : end - start).c_str());
    if (end == std::u16string::npos) return pieces;
    start = end + 1;
  }
}

std::vector<Path> EnvPath::ValidatePathCandidates(Logger& logger, const std::vector<WStr>& candidates,
                                                  const MCHAR* variableName, bool skipMissing) {
  std::vector<Path> folders;
  const MCHAR* name = variableName != nullptr ? variableName : u"";
  for (const WStr& candidate : candidates) {
    const WStr text = ExpandEnvVars(candidate);
    Path path(text);
    if (HasReference(text)) {
      logger.Log(Logger::Warning, 150, name, text.data());
      continue;
    }
    if (IsBlank(text) || !path.IsLegal()) {
      logger.Log(Logger::Warning, 151, name, text.data());
      continue;
    }
    if (!win32::PathFileExistsW(text.data())) {
      logger.Log(Logger::Warning, 152, name, text.data());
      if (skipMissing) continue;
    }
    folders.push_back(path.Normalize());
  }
  return folders;
}

std::vector<Path> EnvPath::ComputePathList(MultiPathVariable variable) {
  if (variable < 0 || variable >= kMultiPathCount) return {};
  const MCHAR* name = kMultiPathNames[variable];
  WStr value;
  if (!GetEnvironmentMSTR(name, value, 0)) return {};
  const WStr expanded = ExpandEnvVars(value);
  const std::u16string text(expanded.data(), static_cast<std::size_t>(expanded.Length()));

  ListCache& cache = Cache();
  {
    std::lock_guard<std::mutex> hold(cache.lock);
    const auto known = cache.texts.find(variable);
    if (known != cache.texts.end() && known->second != text) {
      cache.texts.erase(variable);
      cache.lists.erase(variable);
    }
    const auto list = cache.lists.find(variable);
    if (list != cache.lists.end()) return list->second;
  }
  // Checked outside the lock: the checks look at the disk and log.
  std::vector<Path> list = ValidatePathCandidates(Logger::Default, SplitPath(expanded.data()), name, false);
  std::lock_guard<std::mutex> hold(cache.lock);
  cache.lists[variable] = list;
  cache.texts[variable] = text;
  return list;
}

bool EnvPath::GetSinglePath(SinglePathVariable variable, Path& out) {
  if (variable < 0 || variable >= kSinglePathCount) return false;
  const MCHAR* name = kSinglePathNames[variable];
  WStr value;
  if (!GetEnvironmentMSTR(name, value, kSinglePathLimit + 1)) return false;
  const WStr expanded = ExpandEnvVars(value);
  if (HasReference(expanded)) {
    if (variable != AppData) Logger::Default.Log(Logger::Warning, 150, name, expanded.data());
    return false;
  }
  out = Path(expanded);
  out.Normalize();
  return true;
}

bool EnvPath::GetSinglePathByVynDirectoryID(int directoryId, Path& out) {
  switch (directoryId) {
    case 32: return GetSinglePath(ProjectFolder, out);
    case 48: return GetSinglePath(UserSettings, out);
    case 49: return GetSinglePath(UserTools, out);
    default: return false;
  }
}

unsigned long EnvPath::LocateFile(MultiPathVariable variable, const MCHAR* fileName, unsigned long bufferLength,
                                  MCHAR* buffer, MCHAR** filePart) {
  for (const Path& folder : ComputePathList(variable)) {
    const DWORD found = win32::SearchPathW(folder.GetCStr(), fileName, nullptr, static_cast<DWORD>(bufferLength),
                                           buffer, filePart);
    if (found != 0) return found;
  }
  return 0;
}

bool EnvPath::LocateFile(MultiPathVariable variable, const MCHAR* fileName, WStr& out) {
  // A path longer than the usual buffer is found all the same: the buffer grows to the size asked.
  std::u16string buffer(kLocateBuffer, u'\0');
  for (;;) {
    const unsigned long found =
        LocateFile(variable, fileName, static_cast<unsigned long>(buffer.size()), buffer.data(), nullptr);
    if (found == 0) return false;
    if (found < buffer.size()) {
      out = WStr(buffer.c_str());
      return true;
    }
    buffer.assign(found, u'\0');
  }
}

}  // namespace Util
