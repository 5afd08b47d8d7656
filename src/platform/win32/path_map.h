#pragma once
// Windows-form paths on the POSIX file system. Every file call of the layer passes its path
// through MapPath, so the library above can keep writing "C:\Users\...", "\\server\share\..." and
// relative paths with backslashes.

#include <string>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// The POSIX (UTF-8) form of a Windows-form UTF-16 path:
//   - a "\\?\" prefix is dropped ("\\?\UNC\server\share" is the UNC path "\\server\share");
//   - "X:\rest" and "X:rest" become the root of drive X followed by "/rest"; the root is "/" unless
//     SetDriveRoot or the environment variable TAVLO_PLATFORM_DRIVE_X (X upper case) names
//     another folder; a drive configured as a network drive (network_drives.h) is its share
//     instead: "N:\rest" maps as "\\server\share\rest" does;
//   - "\\server\share\rest" becomes the UNC root followed by "/server/share/rest"; the root is
//     "/mnt/unc" unless SetUncRoot or TAVLO_PLATFORM_UNC_ROOT names another folder;
//   - everything else keeps its place, so relative paths stay relative and POSIX paths pass
//     through unchanged;
//   - every '\' becomes '/'.
// Drive letters are matched without regard to case. A null path gives the empty text.
VYN_API std::string MapPath(const MCHAR* path);

// The root folder of drive letter A to Z (either case); a null root returns the drive to the
// environment variable or the default. Another letter is ignored.
VYN_API void SetDriveRoot(MCHAR drive, const char* root);
// The root folder of UNC paths; null returns it to the environment variable or the default.
VYN_API void SetUncRoot(const char* root);

}  // namespace win32
