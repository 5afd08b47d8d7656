#pragma once
// The shell's path tests on text, as shlwapi answers them; no file is looked at. Only the
// backslash separates components here, as in shlwapi.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"
#include "win32/file_types.h"

namespace win32 {

// TRUE for a text that starts with two backslashes ("\\server\share\x", "\\server", "\\"),
// except the "\\?\" prefix, which counts only as "\\?\UNC\...". FALSE for null.
VYN_API BOOL PathIsUNCW(LPCWSTR pszPath);
// TRUE when the text is "\\server\share": two leading backslashes and exactly one more
// ("\\server\" counts, "\\server\share\" does not).
VYN_API BOOL PathIsUNCServerShareW(LPCWSTR pszPath);
// TRUE for the root of a volume: "\", "X:\" (any character before the colon), and a UNC server
// or share ("\\server", "\\server\share"); FALSE for "\\server\", "\\server\share\", "C:",
// "C:\a", relative paths, null and "".
VYN_API BOOL PathIsRootW(LPCWSTR pszPath);
// FALSE when the text starts with a backslash or its second character is ':'; TRUE otherwise
// (also for null and ""). A POSIX path such as "/tmp" is relative by this rule.
VYN_API BOOL PathIsRelativeW(LPCWSTR pszPath);
// Writes into pszPath (MAX_PATH units) the relative path that leads from pszFrom to pszTo. A
// path whose attribute lacks FILE_ATTRIBUTE_DIRECTORY is a file, and its folder is the start or
// the goal. Components are compared without regard to case. The result climbs with ".." out of
// what is left of pszFrom after the longest common run of whole components, then follows
// pszTo: from "c:\a\b\path" (folder) to "c:\a\x\y\file" (file) gives "..\..\x\y\file"; from
// "c:\a" to "c:\a\b" gives ".\b"; equal folders give ".". FALSE with "" in pszPath when the
// paths share no root ("c:\a" and "d:\a", "\a" and "\b": a lone "\" is no common root), when
// either is null, longer than MAX_PATH - 1, or the result would not fit.
VYN_API BOOL PathRelativePathToW(LPWSTR pszPath, LPCWSTR pszFrom, DWORD dwAttrFrom, LPCWSTR pszTo,
                                 DWORD dwAttrTo);

}  // namespace win32
