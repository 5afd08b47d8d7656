#pragma once
// Locale identifiers (LCIDs) and the code pages Windows associates with them.

#include "vynutil/wintypes.h"

namespace win32::detail {

// The ANSI, OEM and Macintosh code pages of a locale, as Windows reports them. Languages that
// Windows supports only through Unicode give 0, 1 and 2 (CP_ACP, CP_OEMCP, CP_MACCP).
struct LocaleCodePages {
  UINT ansi;
  UINT oem;
  UINT mac;
};

// Fills *pages for a known locale (LOCALE_USER_DEFAULT and LOCALE_SYSTEM_DEFAULT included);
// false for identifiers that name no locale.
bool CodePagesOfLocale(LCID locale, LocaleCodePages* pages) noexcept;

// The user's locale from the environment (LC_ALL, LC_CTYPE, LANG), 1033 for C and POSIX.
LCID EnvironmentLcid() noexcept;

}  // namespace win32::detail
