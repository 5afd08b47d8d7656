#pragma once
// Code-page conversion with Win32 semantics: MultiByteToWideChar, WideCharToMultiByte and the
// code-page queries. Every code page these functions accept converts exactly as Windows does for
// valid text; invalid input follows the Windows rules (U+FFFD for malformed UTF-8, the default
// character '?' for characters a code page cannot hold, ERROR_NO_UNICODE_TRANSLATION with
// MB_ERR_INVALID_CHARS).

#include <cstddef>

#include "vynutil/codepages.h"
#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

inline constexpr DWORD MB_PRECOMPOSED = 0x00000001;
inline constexpr DWORD MB_COMPOSITE = 0x00000002;
inline constexpr DWORD MB_USEGLYPHCHARS = 0x00000004;
inline constexpr DWORD MB_ERR_INVALID_CHARS = 0x00000008;
inline constexpr DWORD WC_COMPOSITECHECK = 0x00000200;
inline constexpr DWORD WC_DISCARDNS = 0x00000010;
inline constexpr DWORD WC_SEPCHARS = 0x00000020;
inline constexpr DWORD WC_DEFAULTCHAR = 0x00000040;
inline constexpr DWORD WC_ERR_INVALID_CHARS = 0x00000080;
inline constexpr DWORD WC_NO_BEST_FIT_CHARS = 0x00000400;

inline constexpr UINT MAX_LEADBYTES = 12;
inline constexpr UINT MAX_DEFAULTCHAR = 2;

struct CPINFO {
  UINT MaxCharSize;                   // 1 for single-byte, 2 for double-byte code pages, 4 for UTF-8
  BYTE DefaultChar[MAX_DEFAULTCHAR];  // the default character, normally '?'
  BYTE LeadByte[MAX_LEADBYTES];       // pairs of lead-byte ranges, ended by two zero bytes
};

// Converts cbMultiByte bytes (-1: up to and including the terminator) of text in CodePage to
// UTF-16. With cchWideChar 0 returns the units needed; otherwise writes at most cchWideChar units
// and returns the count written, or 0 with ERROR_INSUFFICIENT_BUFFER when they do not fit.
// Fails with ERROR_INVALID_PARAMETER on a null source, a zero length or overlapping buffers, and
// with ERROR_INVALID_FLAGS on flags the code page does not take.
VYN_API int MultiByteToWideChar(UINT CodePage, DWORD dwFlags, const char* lpMultiByteStr,
                                int cbMultiByte, MCHAR* lpWideCharStr, int cchWideChar);

// Converts cchWideChar UTF-16 units (-1: up to and including the terminator) to CodePage.
// lpDefaultChar and lpUsedDefaultChar must be null for CP_UTF7 and CP_UTF8
// (ERROR_INVALID_PARAMETER otherwise). Measuring and buffer rules as MultiByteToWideChar.
VYN_API int WideCharToMultiByte(UINT CodePage, DWORD dwFlags, const MCHAR* lpWideCharStr,
                                int cchWideChar, char* lpMultiByteStr, int cbMultiByte,
                                const char* lpDefaultChar, BOOL* lpUsedDefaultChar);

// True when TestChar is a lead byte of the double-byte code page (CP_ACP and the other
// pseudo code pages are resolved first); false for every single-byte code page and UTF-8.
VYN_API BOOL IsDBCSLeadByteEx(UINT CodePage, BYTE TestChar);
VYN_API BOOL IsDBCSLeadByte(BYTE TestChar);

VYN_API BOOL IsValidCodePage(UINT CodePage);
VYN_API BOOL GetCPInfo(UINT CodePage, CPINFO* lpCPInfo);

// The process's active (ANSI) and OEM code pages. The active code page follows the process
// locale's character set (a UTF-8 locale gives 65001, C/POSIX gives 1252); the environment
// variable TAVLO_PLATFORM_ACP (and TAVLO_PLATFORM_OEMCP) overrides it.
VYN_API UINT GetACP();
VYN_API UINT GetOEMCP();
// Pins the process code pages (0 returns that one to the locale or environment default).
// Hosts and tests use it to run as, say, a Japanese (932) process. A value that is not a code
// page this layer converts (a pseudo code page, CP_UTF16, ...) counts as 0.
VYN_API void SetProcessCodePages(UINT acp, UINT oemcp);
// The environment and the locale are read once, at the first need; this forgets that reading so
// the next call reads them again (for hosts that set TAVLO_PLATFORM_ACP after start-up, and
// tests). Pinned code pages stay pinned.
VYN_API void ReloadProcessCodePages();

// Locales: the thread locale (default: the process's user locale) and the locale data the
// code-page normalisation asks for.
inline constexpr LCID LOCALE_SYSTEM_DEFAULT = 0x0800;
inline constexpr LCID LOCALE_USER_DEFAULT = 0x0400;
inline constexpr DWORD LOCALE_RETURN_NUMBER = 0x20000000;
inline constexpr DWORD LOCALE_IDEFAULTCODEPAGE = 0x0000000B;     // OEM code page
inline constexpr DWORD LOCALE_IDEFAULTANSICODEPAGE = 0x00001004;
inline constexpr DWORD LOCALE_IDEFAULTMACCODEPAGE = 0x00001011;

VYN_API LCID GetThreadLocale();
VYN_API BOOL SetThreadLocale(LCID locale);
VYN_API LCID GetUserDefaultLCID();
// Supports the code-page LCTypes above; with LOCALE_RETURN_NUMBER the value is written as one
// DWORD into lpLCData (cchData counts MCHARs, so 2) and 2 is returned.
VYN_API int GetLocaleInfoW(LCID Locale, DWORD LCType, MCHAR* lpLCData, int cchData);

}  // namespace win32

// Fast conversions for the string core: the same results as the Win32 calls above for the same
// input, on size_t lengths, without terminators and without last-error reporting.
namespace win32::text {

// UTF-8 -> UTF-16 with the Windows replacement rules (each maximal invalid subpart becomes
// U+FFFD). Returns the units written; out must have room for n units (the result is never more).
VYN_API std::size_t Utf8ToUtf16(const char* s, std::size_t n, MCHAR* out) noexcept;
// The units Utf8ToUtf16 would write.
VYN_API std::size_t Utf8ToUtf16Length(const char* s, std::size_t n) noexcept;

// UTF-16 -> UTF-8; lone surrogates become U+FFFD (EF BF BD). out must have room for 3n bytes,
// or for the measured length (Utf16ToUtf8Length) plus kUtf8WriteSlack: the vector paths store
// whole 16-byte blocks and may write up to that many bytes past the end of the result.
inline constexpr std::size_t kUtf8WriteSlack = 16;
VYN_API std::size_t Utf16ToUtf8(const MCHAR* s, std::size_t n, char* out) noexcept;
// The bytes Utf16ToUtf8 would write.
VYN_API std::size_t Utf16ToUtf8Length(const MCHAR* s, std::size_t n) noexcept;

}  // namespace win32::text
