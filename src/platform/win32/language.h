#pragma once
// The user's interface language, as Windows reports it.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// The language of the user interface (a LANGID: primary language in the low 10 bits, sublanguage
// above). The environment variable TAVLO_PLATFORM_LANGID, decimal or 0x-hexadecimal, overrides
// it; otherwise it follows the language of the process locale's messages category (LC_ALL, then
// LC_MESSAGES, then LANG), with English (United States, 0x0409) for C, POSIX, unset and unknown
// languages. Read anew at each call.
VYN_API LANGID GetUserDefaultUILanguage();

// The calling thread's user-interface language, which picks the language of resources
// (LoadStringW, FindResourceW): the one SetThreadUILanguage gave this thread, else
// GetUserDefaultUILanguage().
VYN_API LANGID GetThreadUILanguage();
// Sets the calling thread's user-interface language; 0 returns the thread to the default.
// Returns the language now in effect for the thread.
VYN_API LANGID SetThreadUILanguage(LANGID language);

}  // namespace win32

namespace win32::detail {

// The LANGID of a POSIX locale name (language[_territory][.codeset][@modifier]); a bare language
// takes the territory it is most often written in (zh: China, 0x0804). 0 for C, POSIX and names
// that name no Windows language.
VYN_API LANGID LanguageOfLocaleName(const char* name) noexcept;

}  // namespace win32::detail
