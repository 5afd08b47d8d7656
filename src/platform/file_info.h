#pragma once
// What Windows reports about a directory entry (attributes, times, size), read from the POSIX
// file system; shared by the attribute calls and the folder search.

#include <ctime>
#include <string>

#include "vynutil/wintypes.h"
#include "win32/file_types.h"

namespace win32::detail {

struct FileFacts {
  DWORD attributes = 0;
  FILETIME creation{};
  FILETIME lastAccess{};
  FILETIME lastWrite{};
  ULONGLONG size = 0;
};

// The facts of the entry at posixPath (see file_attributes.h for the rules); 0, or the errno of
// the failed lstat.
int FactsOfPath(const std::string& posixPath, FileFacts* facts);

// Copies the facts into a Win32 record with the attribute, time and size fields of
// WIN32_FILE_ATTRIBUTE_DATA (WIN32_FIND_DATAW has the same fields).
template <class Record>
void CopyFacts(const FileFacts& facts, Record* record) {
  record->dwFileAttributes = facts.attributes;
  record->ftCreationTime = facts.creation;
  record->ftLastAccessTime = facts.lastAccess;
  record->ftLastWriteTime = facts.lastWrite;
  record->nFileSizeHigh = static_cast<DWORD>(facts.size >> 32);
  record->nFileSizeLow = static_cast<DWORD>(facts.size);
}

// A POSIX time as a FILETIME; times before 1601 become 0.
FILETIME FileTimeOf(const timespec& time);

// The Windows-only attributes of a path: its override, else its extended attribute, else 0.
DWORD ExtraAttributesOf(const std::string& posixPath);

// The attributes an override or extended attribute may add.
inline constexpr DWORD kExtraAttributeMask =
    FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM | FILE_ATTRIBUTE_ARCHIVE |
    FILE_ATTRIBUTE_TEMPORARY | FILE_ATTRIBUTE_REPARSE_POINT | FILE_ATTRIBUTE_OFFLINE |
    FILE_ATTRIBUTE_NOT_CONTENT_INDEXED | FILE_ATTRIBUTE_RECALL_ON_DATA_ACCESS;

// Sets the override of a POSIX path (0 removes it).
void SetExtraAttributesOf(const std::string& posixPath, DWORD attributes);

}  // namespace win32::detail
