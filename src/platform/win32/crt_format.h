#pragma once
// The C runtime's printf family with the Windows (legacy wide) semantics, for narrow and wide
// formats, and the runtime's locale objects.
//
// Wide formats (MCHAR): %s and %c take MCHAR text/characters, %S and %C narrow ones; %hs/%hc are
// always narrow, %ls/%lc/%ws/%wc always wide. Narrow formats: %s/%c narrow, %S/%C wide. Narrow
// text in a wide format is decoded with the locale's code page, wide text in a narrow format
// encoded with it; a string that does not convert fails the call, a character that does not
// convert is left out. A null string prints "(null)". A precision counts units of the argument
// (a multi-byte character it would split is left out of converted text); a width counts units
// of the output. The '0' flag pads every conversion with zeros except infinities and NaNs.
// Integer sizes: none, %l and %I32 read 32 bits (long is 32 bits on Windows); %hh and %h a char
// and a short; %ll, %I64, %I, %z, %t and %j 64 bits. %p prints 16 upper-case hex digits.
// %L reads a long double; every floating value prints as a double, as on Windows.
// %n is refused (an invalid format), as are unknown conversions and a format ending inside a
// conversion. Floats as the Windows runtime prints them (exponents of at least two digits, %a
// with 13 hex digits by default, "inf", "nan", "-nan(ind)" for the default NaN, "nan(snan)").
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

// The Windows runtime's locale category numbers (they differ from glibc's LC_* values).
inline constexpr int LC_ALL_CRT = 0;
inline constexpr int LC_COLLATE_CRT = 1;
inline constexpr int LC_CTYPE_CRT = 2;
inline constexpr int LC_MONETARY_CRT = 3;
inline constexpr int LC_NUMERIC_CRT = 4;
inline constexpr int LC_TIME_CRT = 5;

// A runtime locale for a Windows locale name: "C", "" (the user's locale with the active code
// page), a language ("Japanese", "korean", "chinese-simplified", "German", "jpn", "ja-JP") with
// an optional "_Country" and an optional ".codepage" (a number, "ACP", "OCP", "utf8"), or a bare
// ".codepage". category (LC_*_CRT) chooses what the name governs: LC_CTYPE the code page,
// LC_NUMERIC the decimal point, LC_ALL both; the others leave both as in "C". Null (errno
// EINVAL) for an unknown category or name, a null name, or a code page the runtime cannot use
// for multi-byte text (anything but single-byte, double-byte and UTF-8). Free with _free_locale.
VYN_API _locale_t _create_locale(int category, const char* locale);
// Frees a locale made by _create_locale; null is ignored.
VYN_API void _free_locale(_locale_t locale);
// The code page that a runtime locale's multi-byte functions use (the active code page for
// null). A "C" character type gives 28591: the runtime's "C" locale takes each byte as the
// character of the same number, which is ISO 8859-1.
VYN_API UINT LocaleCodePage(_locale_t locale);

// Every function below copies its va_list and never advances the caller's, so one list can be
// passed to a measuring call and then to a formatting call (as Windows' pointer-sized va_list
// allows). An invalid format, a null format, or a string argument the locale's code page cannot
// convert make them return -1 (errno EINVAL, EILSEQ); so does output longer than INT_MAX.

// Characters the output needs, without the terminator.
VYN_API int _vscprintf(const char* format, va_list args);
VYN_API int _vscprintf_l(const char* format, _locale_t locale, va_list args);
VYN_API int _vscwprintf(const MCHAR* format, va_list args);
VYN_API int _vscwprintf_l(const MCHAR* format, _locale_t locale, va_list args);

// The secure formatters, with the runtime's rules for size (the buffer's units) and count:
// - null buffer, size 0 or count 0: -1, errno EINVAL (a buffer that exists gets a terminator);
// - count < size, or count == _TRUNCATE: at most min(count, size - 1) characters and a
//   terminator; returns the characters written, or -1 when the output was cut short there
//   (errno unchanged);
// - count >= size otherwise: output longer than size - 1 leaves buffer an empty text, returns
//   -1 with errno ERANGE;
// - failures above: buffer set to an empty text.
VYN_API int _vsnprintf_s(char* buffer, std::size_t size, std::size_t count, const char* format, va_list args);
VYN_API int _vsnprintf_s_l(char* buffer, std::size_t size, std::size_t count, const char* format,
                           _locale_t locale, va_list args);
VYN_API int _vsnwprintf_s(MCHAR* buffer, std::size_t size, std::size_t count, const MCHAR* format, va_list args);
VYN_API int _vsnwprintf_s_l(MCHAR* buffer, std::size_t size, std::size_t count, const MCHAR* format,
                            _locale_t locale, va_list args);

}  // namespace win32
