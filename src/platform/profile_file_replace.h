#pragma once
// Replacing a file's whole content so that a crash at any moment leaves either the old or the
// new content: the new bytes go to a temporary file in the same folder, are flushed to disk, and
// the temporary file is renamed over the old one (then the folder is flushed, so the rename
// itself survives a power failure).

#include <sys/stat.h>

#include <string>
#include <string_view>

#include "file_sharing.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

struct ReplaceTarget {
  std::string path;     // the file itself: symbolic links followed to their end
  bool exists = false;  // whether it exists now
  struct stat info {};  // its status when it exists
};

// Follows symbolic links from posixPath to the file they lead to, which need not exist yet (a
// dangling link is written through, as open would). ERROR_SUCCESS, ERROR_ACCESS_DENIED when the
// end is no regular file (a folder, a device), ERROR_PATH_NOT_FOUND for a loop of links, or the
// error of the failed lstat / readlink (a missing folder gives ERROR_PATH_NOT_FOUND).
DWORD ResolveReplaceTarget(const std::string& posixPath, ReplaceTarget* target);

// Makes bytes the content of target.path. An existing file's permission bits, owner and group
// (where this process may set them) and its Windows attributes (extended attribute
// user.vyn.attributes) pass to the new file; a new file gets 0666 less the umask. *written
// receives the new file's identity. On failure nothing has changed and no temporary file remains:
// ERROR_ACCESS_DENIED when the folder cannot be written, ERROR_PATH_NOT_FOUND when it is
// missing, ERROR_DISK_FULL, or the error of the failed call.
DWORD ReplaceFileContent(const ReplaceTarget& target, std::string_view bytes, FileId* written);

}  // namespace win32::detail
