#pragma once
// The narrow code page of CStr and the runtime locale of the application's language.
//
// Both follow the application's language and are fixed for the life of the process: Chinese
// uses code page 936, Japanese 932 and Korean 949, each with a runtime locale of that language
// and the multi-language mode on (narrow text is counted in double-byte characters); every other
// language uses the active code page (CP_ACP, resolved at each use), no locale, mode off.
// Computed once, on first need, safely from any thread.

#include "vynutil/crt_locale.h"
#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util {

// The encoding tag of CStr text: 932, 936, 949 or CP_ACP (0, not yet normalised).
VYN_API UINT CStrCodePage();
// The runtime locale of the narrow language, or null when the language has none. Lives until
// the process ends.
VYN_API _locale_t CStrLocale();
// True for the Chinese, Japanese and Korean languages.
VYN_API bool CStrMultiLanguageMode();

}  // namespace VynSDK::Util
