#pragma once
// The C runtime's printf family with the Windows (legacy wide) semantics, for narrow and wide
// formats, and the runtime's locale objects.
//
// Wide formats (MCHAR): %s and %c take MCHAR text/characters, %S and %C narrow ones; %hs/%hc are
// always narrow, %ls/%lc/%ws/%wc always wide. Narrow formats: %s/%c narrow, %S/%C wide. Integer
// sizes %I64, %I32, %I, %ll, %l, %h, %hh, %z, %t, %j. %n is refused (an invalid format). Floats
// as the Windows runtime prints them (two-digit exponents, "inf", "nan", "-nan(ind)").
// An invalid format makes the functions return -1 (the Windows runtime's invalid-parameter path
// with the handler returning) and write nothing beyond a terminator.

#include <cstdarg>
#include <cstddef>

#include "vynutil/crt_locale.h"
#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Passed as count to the _s functions: write as much as fits, terminate, return -1 if truncated.
inline constexpr std::size_t _TRUNCATE = static_cast<std::size_t>(-1);

inline constexpr int LC_ALL_CRT = 0;  // the Windows runtime's LC_ALL category number

// A runtime locale for a Windows locale name ("Japanese", "chinese-simplified", "korean", "C",
// "English_United States.1252" ...); null when the name is unknown. Free with _free_locale.
VYN_API _locale_t _create_locale(int category, const char* locale);
VYN_API void _free_locale(_locale_t locale);
// The code page that a runtime locale's multi-byte functions use (the active code page for null).
VYN_API UINT LocaleCodePage(_locale_t locale);

// Characters the output needs, without the terminator; -1 for an invalid format.
VYN_API int _vscprintf(const char* format, va_list args);
VYN_API int _vscprintf_l(const char* format, _locale_t locale, va_list args);
VYN_API int _vscwprintf(const MCHAR* format, va_list args);
VYN_API int _vscwprintf_l(const MCHAR* format, _locale_t locale, va_list args);

// The secure, truncating formatters: write at most min(count, size - 1) characters and a
// terminator. Returns the characters written, or -1 when the output was truncated (count is
// _TRUNCATE) or the format is invalid (buffer set to an empty text).
VYN_API int _vsnprintf_s(char* buffer, std::size_t size, std::size_t count, const char* format, va_list args);
VYN_API int _vsnprintf_s_l(char* buffer, std::size_t size, std::size_t count, const char* format,
                           _locale_t locale, va_list args);
VYN_API int _vsnwprintf_s(MCHAR* buffer, std::size_t size, std::size_t count, const MCHAR* format, va_list args);
VYN_API int _vsnwprintf_s_l(MCHAR* buffer, std::size_t size, std::size_t count, const MCHAR* format,
                            _locale_t locale, va_list args);

}  // namespace win32
