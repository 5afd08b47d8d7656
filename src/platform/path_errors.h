#pragma once
// Win32 codes for failed calls on paths. POSIX says ENOENT both for a missing file and for a
// missing folder on the way to it; Windows tells them apart.

#include <string>

#include "vynutil/wintypes.h"

namespace win32::detail {

// ERROR_FILE_NOT_FOUND when the folder that would hold the last component of posixPath exists,
// ERROR_PATH_NOT_FOUND when that folder is missing or is not a folder.
DWORD MissingPathError(const std::string& posixPath);

// ErrorFromErrno for a call on posixPath, with ENOENT sorted by MissingPathError and ENOTDIR (a
// file where a folder should be) giving ERROR_PATH_NOT_FOUND.
DWORD PathError(int errnoValue, const std::string& posixPath);

// The POSIX path of a Windows-form path argument (MapPath), or false with ERROR_PATH_NOT_FOUND
// set for a null or empty one, as the Win32 file functions answer those.
bool MapPathArgument(const MCHAR* path, std::string* posixPath);

// The folder part of a POSIX path: "." for a bare name, "/" for a name in the root.
std::string ParentFolder(const std::string& posixPath);

}  // namespace win32::detail
