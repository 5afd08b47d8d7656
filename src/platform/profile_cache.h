#pragma once
// Parsed profile files, kept per process and keyed by the file's identity (device and inode), so
// every name of a file (links, relative and absolute spellings) shares one parsed copy.
//
// A cached copy is used while the file's size, modification and change times (nanoseconds),
// inode and device are those it was read with. Time stamps come from a clock that ticks in steps
// (a few milliseconds; seconds on some file systems), so a change made within one step of the
// reading could keep every stamp: a copy read that soon after the file's last modification is
// "unsettled", and each use compares it with the file's bytes until it is old enough to trust.
// A lookup of a settled, unchanged file costs one stat and one hash lookup.
//
// Safe to use from any number of threads: lookups share a lock, loading happens outside it.

#include <memory>
#include <string>

#include "file_sharing.h"
#include "profile_document.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

struct ProfileRead {
  std::shared_ptr<const ProfileDocument> document;  // null when there is no readable file
  // ERROR_SUCCESS with a document; otherwise why there is none: ERROR_FILE_NOT_FOUND,
  // ERROR_PATH_NOT_FOUND (missing folder), ERROR_ACCESS_DENIED (a folder or other non-file, or
  // no permission), ERROR_FILE_TOO_LARGE, ERROR_NOT_ENOUGH_MEMORY, or the error of the system call.
  DWORD error = 0;
};

// The current content of the file at posixPath (symbolic links followed).
ProfileRead ReadProfile(const std::string& posixPath);

// Records document as the content of the file this process has just written at posixPath, so
// that the next read needs neither reading nor parsing. written is the identity of the file that
// was written: when posixPath names another file by now, nothing is recorded.
void RememberProfile(const std::string& posixPath, const FileId& written,
                     std::shared_ptr<const ProfileDocument> document);

// Drops every cached file.
void ForgetProfiles();

}  // namespace win32::detail
