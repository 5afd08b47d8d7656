// FindFirstFileW and its family: a folder read once, filtered by the mask, sorted as NTFS lists.

#include "win32/find_file.h"

#include <dirent.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include "file_info.h"
#include "file_name_mask.h"
#include "handle_table.h"
#include "path_errors.h"
#include "syscalls.h"
#include "utf_strings.h"
#include "win32/crt_ctype.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"
#include "win32/path_map.h"
#include "win32/shell_path.h"

namespace win32 {

namespace {

struct Match {
  std::string posixName;
  std::u16string name;
};

class FindSearch : public detail::HandleObject {
 public:
  FindSearch(std::string folder, std::vector<Match> matches)
      : folder_(std::move(folder)), matches_(std::move(matches)) {}

  // Describes the next match that still exists; false at the end.
  bool Next(WIN32_FIND_DATAW* data) {
    while (next_ < matches_.size()) {
      const Match& match = matches_[next_++];
      detail::FileFacts facts;
      if (detail::FactsOfPath(folder_ + "/" + match.posixName, &facts) != 0) continue;
      Fill(match.name, facts, data);
      return true;
    }
    return false;
  }

 private:
  static void Fill(const std::u16string& name, const detail::FileFacts& facts,
                   WIN32_FIND_DATAW* data) {
    std::memset(data, 0, sizeof *data);
    detail::CopyFacts(facts, data);
    const std::size_t length = std::min<std::size_t>(name.size(), MAX_PATH - 1);
    std::copy_n(name.data(), length, data->cFileName);
  }

  std::string folder_;
  std::vector<Match> matches_;
  std::size_t next_ = 0;
};

bool IsDotEntry(const std::u16string& name) { return name == u"." || name == u".."; }

// NTFS order: "." and ".." first, then names compared by their upper-case forms.
bool ListedBefore(const Match& a, const Match& b) {
  const bool aDots = IsDotEntry(a.name), bDots = IsDotEntry(b.name);
  if (aDots != bDots) return aDots;
  if (aDots) return a.name.size() < b.name.size();
  const std::size_t common = std::min(a.name.size(), b.name.size());
  for (std::size_t i = 0; i < common; ++i) {
    const std::uint32_t x = towupper(a.name[i]), y = towupper(b.name[i]);
    if (x != y) return x < y;
  }
  if (a.name.size() != b.name.size()) return a.name.size() < b.name.size();
  return a.name < b.name;
}

// A root folder (a drive, a share, "\" or the POSIX root) lists no "." and "..".
bool IsRootFolder(const std::u16string& folderText, const std::string& posixFolder) {
  std::u16string trimmed = folderText;
  while (trimmed.size() > 1 && (trimmed.back() == u'\\' || trimmed.back() == u'/')) {
    trimmed.pop_back();
  }
  if (PathIsRootW(folderText.c_str()) || PathIsRootW((trimmed + u"\\").c_str()) ||
      PathIsUNCServerShareW(trimmed.c_str())) {
    return true;
  }
  return std::filesystem::path(posixFolder).lexically_normal() == "/";
}

HANDLE Fail(DWORD error) {
  SetLastError(error);
  return INVALID_HANDLE_VALUE;
}

}  // namespace

HANDLE FindFirstFileW(LPCWSTR lpFileName, WIN32_FIND_DATAW* lpFindFileData) {
  if (lpFindFileData == nullptr) return Fail(ERROR_INVALID_PARAMETER);
  std::string ignored;
  if (!detail::MapPathArgument(lpFileName, &ignored)) return INVALID_HANDLE_VALUE;
  const std::u16string pattern = lpFileName;
  const std::size_t slash = pattern.find_last_of(u"\\/");
  std::u16string folderText, mask;
  if (slash != std::u16string::npos) {
    folderText = pattern.substr(0, slash + 1);
    mask = pattern.substr(slash + 1);
  } else if (pattern.size() >= 2 && pattern[1] == u':') {
    folderText = pattern.substr(0, 2);
    mask = pattern.substr(2);
  } else {
    mask = pattern;
  }
  if (mask.empty()) return Fail(ERROR_FILE_NOT_FOUND);
  const std::string folder = folderText.empty() ? std::string(".") : MapPath(folderText.c_str());

  const sys::SyscallTable& calls = sys::Syscalls();
  DIR* listing = calls.opendir(folder.c_str());
  if (listing == nullptr) {
    return Fail(errno == ENOENT || errno == ENOTDIR ? ERROR_PATH_NOT_FOUND : ErrorFromErrno(errno));
  }
  const bool root = IsRootFolder(folderText, folder);
  std::vector<Match> matches;
  while (const dirent* entry = calls.readdir(listing)) {
    Match match{entry->d_name, detail::Utf16Of(entry->d_name)};
    if (root && IsDotEntry(match.name)) continue;
    if (detail::MatchesFileMask(match.name, mask)) matches.push_back(std::move(match));
  }
  calls.closedir(listing);
  std::sort(matches.begin(), matches.end(), ListedBefore);

  auto search = std::make_shared<FindSearch>(folder, std::move(matches));
  if (!search->Next(lpFindFileData)) return Fail(ERROR_FILE_NOT_FOUND);
  return detail::RegisterHandle(std::move(search));
}

BOOL FindNextFileW(HANDLE hFindFile, WIN32_FIND_DATAW* lpFindFileData) {
  std::shared_ptr<FindSearch> search = detail::FindHandleOf<FindSearch>(hFindFile);
  if (search == nullptr) {
    SetLastError(ERROR_INVALID_HANDLE);
    return FALSE;
  }
  if (lpFindFileData == nullptr) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
  }
  if (!search->Next(lpFindFileData)) {
    SetLastError(ERROR_NO_MORE_FILES);
    return FALSE;
  }
  return TRUE;
}

BOOL FindClose(HANDLE hFindFile) {
  if (detail::TakeHandleOf<FindSearch>(hFindFile) == nullptr) {
    SetLastError(ERROR_INVALID_HANDLE);
    return FALSE;
  }
  return TRUE;
}

}  // namespace win32
