// Existence tests for files and folders: through the host's missing-path cache when it offers
// one, else on the file system, with the cloud-storage rules and optional timing logs.

#include "vynutil/file_exists.h"

#include <chrono>
#include <string>

#include "vynutil/host_registry.h"
#include "vynutil/utility_interface.h"
#include "win32/file_attributes.h"
#include "win32/process.h"

namespace {

constexpr MCHAR kLoggingSwitch[] = u"KORV_TAVLO_2015_UtilFileExistsLogging";

// The host's cache, kept once found; a null answer is asked again next time.
IMissingPathCache* file_test_cache = nullptr;
IMissingPathCache* directory_test_cache = nullptr;

int resolve_unc = 0;
int resolve_to_relative = 0;

IMissingPathCache* MissingPathCache(IMissingPathCache*& kept) {
  IAppInternal* app = UtilGetIAppInternal();
  if (!app) return nullptr;
  if (!kept) kept = static_cast<IMissingPathCache*>(app->GetInterface(MISSING_PATH_CACHE_INTERFACE_ID));
  return kept;
}

// Times one test and, when logging is on and the host has a system log, reports it there.
class TestLog {
 public:
  TestLog(bool loggingOn, const MCHAR* format)
      : log_(loggingOn && UtilGetCOREInterface() ? UtilGetCOREInterface()->Log() : nullptr),
        format_(format),
        start_(std::chrono::steady_clock::now()) {}

  void Report(const MCHAR* path, bool result) const {
    if (!log_) return;
    const std::chrono::duration<double, std::milli> elapsed = std::chrono::steady_clock::now() - start_;
    log_->LogEntry(SYSLOG_DEBUG, NO_DIALOG, u"", format_, path, result ? 1 : 0, elapsed.count(),
                   win32::GetCurrentThreadId());
  }

 private:
  LogSys* log_;
  const MCHAR* format_;
  std::chrono::steady_clock::time_point start_;
};

bool Attributes(const MCHAR* path, DWORD* attributes) {
  win32::WIN32_FILE_ATTRIBUTE_DATA data;
  if (!path || !win32::GetFileAttributesExW(path, win32::GetFileExInfoStandard, &data)) return false;
  *attributes = data.dwFileAttributes;
  return true;
}

// An offline, archived entry counts as present when a folder on its path whose name holds
// "Dropbox" is read-only: such files are kept in the cloud and fetched on access. Components are
// separated by backslashes or, as on this system, forward slashes.
bool UnderReadOnlyDropboxFolder(const std::u16string& path) {
  std::size_t start = 0;
  while (start <= path.size()) {
    std::size_t end = path.find_first_of(u"\\/", start);
    if (end == std::u16string::npos) end = path.size();
    const std::u16string_view component = std::u16string_view(path).substr(start, end - start);
    if (component.size() >= 7 && component.find(u"Dropbox") != std::u16string_view::npos) {
      const std::u16string prefix = path.substr(0, end < path.size() ? end + 1 : end);
      DWORD attributes = 0;
      if (Attributes(prefix.c_str(), &attributes) && (attributes & win32::FILE_ATTRIBUTE_READONLY)) {
        return true;
      }
    }
    start = end + 1;
  }
  return false;
}

bool Present(const MCHAR* path, DWORD attributes) {
  if (attributes & (win32::FILE_ATTRIBUTE_REPARSE_POINT | win32::FILE_ATTRIBUTE_RECALL_ON_DATA_ACCESS)) {
    return true;
  }
  if (!(attributes & win32::FILE_ATTRIBUTE_OFFLINE)) return true;
  if (!(attributes & win32::FILE_ATTRIBUTE_ARCHIVE)) return false;
  return UnderReadOnlyDropboxFolder(path);
}

}  // namespace

bool UtilFileExists(const MCHAR* path, bool acceptDirectory) {
  if (IMissingPathCache* cache = MissingPathCache(file_test_cache)) {
    return cache->FileExists(path, acceptDirectory);
  }
  return UtilFileExists_NoMissingPathCache(path, acceptDirectory, nullptr);
}

bool UtilDirectoryExists(const MCHAR* path) {
  if (IMissingPathCache* cache = MissingPathCache(directory_test_cache)) {
    return cache->DirectoryExists(path);
  }
  return UtilDirectoryExists_NoMissingPathCache(path, nullptr);
}

bool UtilFileExists_NoMissingPathCache(const MCHAR* path, bool acceptDirectory, bool* available) {
  static const bool logging = UtilityInterface::GetBoolEnvironmentVariable(kLoggingSwitch, false);
  const TestLog log(logging, u"DoesFileExist: File: %s; res: %d; t: %.2lf ms; tid: %X");
  DWORD attributes = 0;
  const bool present = Attributes(path, &attributes) && Present(path, attributes);
  if (available) *available = present;
  const bool result = present && (acceptDirectory || !(attributes & win32::FILE_ATTRIBUTE_DIRECTORY));
  log.Report(path, result);
  return result;
}

bool UtilDirectoryExists_NoMissingPathCache(const MCHAR* path, bool* available) {
  static const bool logging = UtilityInterface::GetBoolEnvironmentVariable(kLoggingSwitch, false);
  const TestLog log(logging, u"DoesDirectoryExist: Directory: %s; res: %d; t: %.2lf ms; tid: %X");
  DWORD attributes = 0;
  const bool found = Attributes(path, &attributes);
  if (available) *available = found && !(attributes & win32::FILE_ATTRIBUTE_OFFLINE);
  const bool result = found && (attributes & win32::FILE_ATTRIBUTE_DIRECTORY);
  log.Report(path, result);
  return result;
}

void SetResolveUNC(int value) { resolve_unc = value; }
int GetResolveUNC() { return resolve_unc; }
void SetResolveToRelative(int value) { resolve_to_relative = value; }
int GetResolveToRelative() { return resolve_to_relative; }
