// The private-profile write functions: one edit of the file, written atomically.

#include <fcntl.h>
#include <sys/stat.h>

#include <array>
#include <cerrno>
#include <functional>
#include <mutex>
#include <new>
#include <optional>
#include <string>
#include <vector>

#include "file_sharing.h"
#include "path_errors.h"
#include "profile_cache.h"
#include "profile_edit.h"
#include "profile_file_replace.h"
#include "profile_location.h"
#include "profile_text.h"
#include "profile_values.h"
#include "syscalls.h"
#include "win32/codepage.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"
#include "win32/profile.h"

namespace win32 {

namespace {

using detail::ProfileDocument;
using detail::profile::Text;

using Edit = std::function<detail::profile_edit::Bytes(const ProfileDocument*)>;

BOOL Fail(DWORD error) {
  SetLastError(error);
  return FALSE;
}

Text NameArgument(const MCHAR* name) {
  return detail::profile::TrimBlanks(detail::profile::ArgumentText(name));
}

bool HasLineBreak(Text text) { return text.find_first_of(u"\r\n") != Text::npos; }

// Names and values that would change the file's layout when written: the file would then read
// differently (a key turning up in another section, a value turning into a new entry).
bool ValidSection(Text name) { return !HasLineBreak(name) && name.find(u']') == Text::npos; }
bool ValidKey(Text name) {
  return !HasLineBreak(name) && name.find(u'=') == Text::npos && (name.empty() || name[0] != u'[');
}
bool ValidLine(Text line) {
  const Text trimmed = detail::profile::TrimBlanks(line);
  return !HasLineBreak(line) && (trimmed.empty() || trimmed[0] != u'[');
}

// Writes from this process to one file, one at a time: a write reads the file, edits it and
// replaces it, and two of them at once would lose one change. The file is known by its folder's
// identity and its name, so every spelling of its path meets on the same lock.
std::mutex& WriteLock(const std::string& path) {
  static std::array<std::mutex, 64> stripes;
  struct stat folder {};
  std::size_t key = 0;
  if (sys::Syscalls().stat(detail::ParentFolder(path).c_str(), &folder) == 0) {
    key = static_cast<std::size_t>(folder.st_dev) * 31 + static_cast<std::size_t>(folder.st_ino);
  }
  const std::string::size_type slash = path.rfind('/');
  const std::string name = slash == std::string::npos ? path : path.substr(slash + 1);
  key = key * 1000003 ^ std::hash<std::string>()(name);
  return stripes[key % stripes.size()];
}

// The existing file opened for reading and writing with the rights of a Windows profile write,
// so that a handle that denies others writing (or reading) makes the write fail with
// ERROR_SHARING_VIOLATION, as on Windows. Held until the file has been replaced.
class WriteAccess {
 public:
  WriteAccess() = default;
  WriteAccess(const WriteAccess&) = delete;
  WriteAccess& operator=(const WriteAccess&) = delete;
  ~WriteAccess() {
    claim_ = detail::ShareClaim();
    if (fd_ >= 0) sys::Syscalls().close(fd_);
  }

  DWORD Take(const detail::ReplaceTarget& target) {
    // The read-only attribute binds everyone on Windows, administrators included.
    if ((target.info.st_mode & S_IWUSR) == 0) return ERROR_ACCESS_DENIED;
    const sys::SyscallTable& calls = sys::Syscalls();
    fd_ = calls.open(target.path.c_str(), O_RDWR | O_CLOEXEC | O_NONBLOCK, 0);
    if (fd_ < 0) return detail::PathError(errno, target.path);
    struct stat info {};
    if (calls.fstat(fd_, &info) != 0) return ErrorFromErrno(errno);
    const unsigned rights = detail::kRightRead | detail::kRightWrite;
    return detail::ShareClaim::Take(fd_, true, detail::FileId{info.st_dev, info.st_ino}, rights,
                                    rights, &claim_);
  }

 private:
  int fd_ = -1;
  detail::ShareClaim claim_;
};

BOOL WriteProfile(const MCHAR* fileName, const Edit& edit) {
  try {
    const detail::ProfileLocation location = detail::LocateProfile(fileName);
    if (location.inWindowsFolder) detail::CreateWindowsFolder();
    detail::ReplaceTarget target;
    DWORD error = detail::ResolveReplaceTarget(location.path, &target);
    if (error != ERROR_SUCCESS) return Fail(error);
    std::lock_guard<std::mutex> lock(WriteLock(target.path));
    // Again under the lock: another thread may have replaced the file meanwhile.
    if ((error = detail::ResolveReplaceTarget(location.path, &target)) != ERROR_SUCCESS) {
      return Fail(error);
    }
    WriteAccess access;
    detail::ProfileRead current;
    if (target.exists) {
      if ((error = access.Take(target)) != ERROR_SUCCESS) return Fail(error);
      current = detail::ReadProfile(target.path);
      if (!current.document) return Fail(current.error);
    }
    std::optional<std::string> edited = edit(current.document.get());
    if (!edited) return Fail(ERROR_NO_UNICODE_TRANSLATION);
    std::string bytes = std::move(*edited);
    if (bytes.size() > ProfileDocument::kMaxBytes) return Fail(ERROR_FILE_TOO_LARGE);
    if (current.document && bytes == current.document->bytes()) {
      SetLastError(ERROR_SUCCESS);
      return TRUE;
    }
    detail::FileId written;
    if ((error = detail::ReplaceFileContent(target, bytes, &written)) != ERROR_SUCCESS) {
      return Fail(error);
    }
    const UINT codePage = current.document ? current.document->codePage() : GetACP();
    detail::RememberProfile(target.path, written,
                            ProfileDocument::Parse(std::move(bytes), codePage));
    // Windows reports the file it had to create through the last error even on success.
    SetLastError(target.exists ? ERROR_SUCCESS : ERROR_FILE_NOT_FOUND);
    return TRUE;
  } catch (const std::bad_alloc&) {
    return Fail(ERROR_NOT_ENOUGH_MEMORY);
  }
}

BOOL DeleteSection(Text section, const MCHAR* fileName) {
  return WriteProfile(fileName, [section](const ProfileDocument* doc) {
    return detail::profile_edit::DeleteSection(doc, section);
  });
}

}  // namespace

BOOL WritePrivateProfileStringW(LPCWSTR lpAppName, LPCWSTR lpKeyName, LPCWSTR lpString,
                                LPCWSTR lpFileName) {
  if (lpAppName == nullptr) {
    if (lpKeyName == nullptr && lpString == nullptr) {
      // Windows flushes its cached file here and returns zero.
      detail::ForgetProfiles();
      return Fail(ERROR_SUCCESS);
    }
    return Fail(ERROR_FILE_NOT_FOUND);
  }
  const Text section = NameArgument(lpAppName);
  if (!ValidSection(section)) return Fail(ERROR_INVALID_PARAMETER);
  if (lpKeyName == nullptr) return DeleteSection(section, lpFileName);
  const Text key = NameArgument(lpKeyName);
  if (!ValidKey(key)) return Fail(ERROR_INVALID_PARAMETER);
  if (lpString == nullptr) {
    return WriteProfile(lpFileName, [&](const ProfileDocument* doc) {
      return detail::profile_edit::DeleteKey(doc, section, key);
    });
  }
  const Text value = detail::profile::ArgumentText(lpString);
  if (HasLineBreak(value)) return Fail(ERROR_INVALID_PARAMETER);
  return WriteProfile(lpFileName, [&](const ProfileDocument* doc) {
    return detail::profile_edit::SetValue(doc, section, key, value);
  });
}

BOOL WritePrivateProfileSectionW(LPCWSTR lpAppName, LPCWSTR lpString, LPCWSTR lpFileName) {
  if (lpAppName == nullptr) return Fail(ERROR_FILE_NOT_FOUND);
  const Text section = NameArgument(lpAppName);
  if (!ValidSection(section)) return Fail(ERROR_INVALID_PARAMETER);
  if (lpString == nullptr) return DeleteSection(section, lpFileName);
  try {
    std::vector<Text> lines;
    for (const MCHAR* p = lpString; *p != 0; p += lines.back().size() + 1) {
      lines.push_back(detail::profile::ArgumentText(p));
      if (!ValidLine(lines.back())) return Fail(ERROR_INVALID_PARAMETER);
    }
    return WriteProfile(lpFileName, [&](const ProfileDocument* doc) {
      return detail::profile_edit::ReplaceSection(doc, section, lines);
    });
  } catch (const std::bad_alloc&) {
    return Fail(ERROR_NOT_ENOUGH_MEMORY);
  }
}

BOOL WritePrivateProfileStructW(LPCWSTR lpszSection, LPCWSTR lpszKey, const void* lpStruct,
                                UINT uSizeStruct, LPCWSTR szFile) {
  if (lpszSection == nullptr) return Fail(ERROR_FILE_NOT_FOUND);
  const Text section = NameArgument(lpszSection);
  if (!ValidSection(section)) return Fail(ERROR_INVALID_PARAMETER);
  if (lpszKey == nullptr) return DeleteSection(section, szFile);
  const Text key = NameArgument(lpszKey);
  if (!ValidKey(key)) return Fail(ERROR_INVALID_PARAMETER);
  if (lpStruct == nullptr) {
    return WriteProfile(szFile, [&](const ProfileDocument* doc) {
      return detail::profile_edit::DeleteKey(doc, section, key);
    });
  }
  // Two digits a byte, in a file this layer could still read back.
  if (2 * (std::uint64_t{uSizeStruct} + 1) > ProfileDocument::kMaxBytes) {
    return Fail(ERROR_FILE_TOO_LARGE);
  }
  try {
    const std::u16string value = detail::profile::EncodeStruct(lpStruct, uSizeStruct);
    return WriteProfile(szFile, [&](const ProfileDocument* doc) {
      return detail::profile_edit::SetValue(doc, section, key, value);
    });
  } catch (const std::bad_alloc&) {
    return Fail(ERROR_NOT_ENOUGH_MEMORY);
  }
}

}  // namespace win32
