#pragma once
// Existence tests for files and folders. They ask the host's missing-path cache when the host
// offers one, else the file system; the direct tests know about files that cloud storage keeps
// online only. With the environment switch KORV_TAVLO_2015_UtilFileExistsLogging on, every
// direct test is logged with its duration to the host's system log.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"
#include "vynutil/wstr.h"

// Whether the file exists; a folder counts only with acceptDirectory.
VYN_API bool UtilFileExists(const MCHAR* path, bool acceptDirectory);
// Whether the folder exists.
VYN_API bool UtilDirectoryExists(const MCHAR* path);
// The file-system test without the host's cache. available (when given) receives whether the
// entry is present and its contents can be had (not kept online only).
VYN_API bool UtilFileExists_NoMissingPathCache(const MCHAR* path, bool acceptDirectory, bool* available);
VYN_API bool UtilDirectoryExists_NoMissingPathCache(const MCHAR* path, bool* available);
// The UNC form of a path on a mapped network drive ("N:\a" → "\\server\share\a"): 1 with the
// form in out, else 0 with out empty.
VYN_API int UtilGetUniversalFilename(WStr& out, const MCHAR* path);
// Two switches the host keeps here about path resolution; the library does not consult them.
VYN_API void SetResolveUNC(int value);
VYN_API int GetResolveUNC();
VYN_API void SetResolveToRelative(int value);
VYN_API int GetResolveToRelative();
