#pragma once
// The C runtime's string helpers for the SDK's character type, with Windows semantics.

#include <cstddef>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Units before the first zero unit.
VYN_API std::size_t wcslen(const MCHAR* s) noexcept;

// Case-insensitive comparisons. _wcsicmp folds each UTF-16 unit with the simple Unicode
// lower-case mapping (as under a user locale on Windows) and returns the difference of the first
// pair of folded units that differ, 0 when none do. _stricmp folds ASCII letters only and returns
// the difference of the folded bytes taken as unsigned. The n-forms stop after n units (n = 0
// gives 0). A null argument gives INT_MAX with errno EINVAL, as the runtime's invalid-parameter
// path does when it returns.
VYN_API int _wcsicmp(const MCHAR* a, const MCHAR* b) noexcept;
VYN_API int _wcsnicmp(const MCHAR* a, const MCHAR* b, std::size_t n) noexcept;
VYN_API int _stricmp(const char* a, const char* b) noexcept;
VYN_API int _strnicmp(const char* a, const char* b, std::size_t n) noexcept;

}  // namespace win32
