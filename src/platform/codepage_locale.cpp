// Locale identifiers: the code pages Windows gives each language, the thread locale, and
// GetLocaleInfoW for the code-page values.

#include "codepage_locale.h"

#include <unicode/uloc.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <string>

#include "win32/codepage.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {

constexpr LCID kEnglishUs = 0x0409;
constexpr LCID kLocaleInvariant = 0x007F;
constexpr LCID kLocaleNeutral = 0x0000;

struct LanguageCodePages {
  WORD id;  // a primary language (10 bits) or a whole LANGID (16 bits)
  LocaleCodePages pages;
};

// Locales whose code pages differ from their language's row below.
constexpr LanguageCodePages kByLangId[] = {
    {0x0409, {1252, 437, 10000}},  // English (United States)
    {0x0404, {950, 950, 10002}},   // Chinese (Taiwan)
    {0x0C04, {950, 950, 10002}},   // Chinese (Hong Kong)
    {0x1404, {950, 950, 10002}},   // Chinese (Macao)
    {0x7C04, {950, 950, 10002}},   // Chinese (Traditional)
    {0x0804, {936, 936, 10008}},   // Chinese (PRC)
    {0x1004, {936, 936, 10008}},   // Chinese (Singapore)
    {0x0004, {936, 936, 10008}},   // Chinese (Simplified)
    {0x041A, {1250, 852, 10082}},  // Croatian
    {0x101A, {1250, 852, 10082}},  // Croatian (Bosnia and Herzegovina)
    {0x141A, {1250, 852, 10082}},  // Bosnian (Latin)
    {0x201A, {1251, 855, 10007}},  // Bosnian (Cyrillic)
    {0x081A, {1250, 852, 10029}},  // Serbian (Latin, Serbia and Montenegro)
    {0x181A, {1250, 852, 10029}},  // Serbian (Latin, Bosnia and Herzegovina)
    {0x241A, {1250, 852, 10029}},  // Serbian (Latin, Serbia)
    {0x2C1A, {1250, 852, 10029}},  // Serbian (Latin, Montenegro)
    {0x0C1A, {1251, 855, 10007}},  // Serbian (Cyrillic, Serbia and Montenegro)
    {0x1C1A, {1251, 855, 10007}},  // Serbian (Cyrillic, Bosnia and Herzegovina)
    {0x281A, {1251, 855, 10007}},  // Serbian (Cyrillic, Serbia)
    {0x301A, {1251, 855, 10007}},  // Serbian (Cyrillic, Montenegro)
    {0x7C1A, {1251, 855, 10007}},  // Serbian
    {0x082C, {1251, 866, 10007}},  // Azerbaijani (Cyrillic)
    {0x0843, {1251, 866, 10007}},  // Uzbek (Cyrillic)
};

constexpr LanguageCodePages kByLanguage[] = {
    {0x01, {1256, 720, 10004}},   // Arabic
    {0x02, {1251, 866, 10007}},   // Bulgarian
    {0x03, {1252, 850, 10000}},   // Catalan
    {0x05, {1250, 852, 10029}},   // Czech
    {0x06, {1252, 850, 10000}},   // Danish
    {0x07, {1252, 850, 10000}},   // German
    {0x08, {1253, 737, 10006}},   // Greek
    {0x09, {1252, 850, 10000}},   // English
    {0x0A, {1252, 850, 10000}},   // Spanish
    {0x0B, {1252, 850, 10000}},   // Finnish
    {0x0C, {1252, 850, 10000}},   // French
    {0x0D, {1255, 862, 10005}},   // Hebrew
    {0x0E, {1250, 852, 10029}},   // Hungarian
    {0x0F, {1252, 850, 10079}},   // Icelandic
    {0x10, {1252, 850, 10000}},   // Italian
    {0x11, {932, 932, 10001}},    // Japanese
    {0x12, {949, 949, 10003}},    // Korean
    {0x13, {1252, 850, 10000}},   // Dutch
    {0x14, {1252, 850, 10000}},   // Norwegian
    {0x15, {1250, 852, 10029}},   // Polish
    {0x16, {1252, 850, 10000}},   // Portuguese
    {0x18, {1250, 852, 10029}},   // Romanian
    {0x19, {1251, 866, 10007}},   // Russian
    {0x1B, {1250, 852, 10029}},   // Slovak
    {0x1C, {1250, 852, 10029}},   // Albanian
    {0x1D, {1252, 850, 10000}},   // Swedish
    {0x1E, {874, 874, 10021}},    // Thai
    {0x1F, {1254, 857, 10081}},   // Turkish
    {0x20, {1256, 720, 10004}},   // Urdu
    {0x21, {1252, 850, 10000}},   // Indonesian
    {0x22, {1251, 866, 10017}},   // Ukrainian
    {0x23, {1251, 866, 10007}},   // Belarusian
    {0x24, {1250, 852, 10029}},   // Slovenian
    {0x25, {1257, 775, 10029}},   // Estonian
    {0x26, {1257, 775, 10029}},   // Latvian
    {0x27, {1257, 775, 10029}},   // Lithuanian
    {0x29, {1256, 720, 10004}},   // Persian
    {0x2A, {1258, 1258, 10000}},  // Vietnamese
    {0x2C, {1254, 857, 10081}},   // Azerbaijani (Latin)
    {0x2D, {1252, 850, 10000}},   // Basque
    {0x2F, {1251, 866, 10007}},   // Macedonian
    {0x36, {1252, 850, 10000}},   // Afrikaans
    {0x38, {1252, 850, 10079}},   // Faroese
    {0x3E, {1252, 850, 10000}},   // Malay
    {0x3F, {1251, 866, 10007}},   // Kazakh
    {0x40, {1251, 866, 10007}},   // Kyrgyz
    {0x41, {1252, 437, 10000}},   // Swahili
    {0x43, {1254, 857, 10029}},   // Uzbek (Latin)
    {0x44, {1251, 866, 10007}},   // Tatar
    {0x56, {1252, 850, 10000}},   // Galician
};

const LocaleCodePages* Find(const LanguageCodePages* table, std::size_t size, WORD id) {
  for (std::size_t i = 0; i < size; ++i) {
    if (table[i].id == id) return &table[i].pages;
  }
  return nullptr;
}

// Identifiers Windows accepts in place of a locale.
LCID ResolveLocale(LCID locale) {
  if (locale == LOCALE_USER_DEFAULT || locale == LOCALE_SYSTEM_DEFAULT ||
      locale == kLocaleNeutral) {
    return GetUserDefaultLCID();
  }
  return locale;
}

}  // namespace

bool CodePagesOfLocale(LCID locale, LocaleCodePages* pages) noexcept {
  locale = ResolveLocale(locale);
  if (locale == kLocaleInvariant) {
    *pages = {1252, 437, 10000};
    return true;
  }
  const WORD langId = static_cast<WORD>(locale & 0xFFFF);  // the sort bits do not matter here
  const LocaleCodePages* found = Find(kByLangId, std::size(kByLangId), langId);
  if (found == nullptr) found = Find(kByLanguage, std::size(kByLanguage), langId & 0x3FF);
  if (found != nullptr) {
    *pages = *found;
    return true;
  }
  // A locale Windows knows but supports only through Unicode (Hindi, Armenian, ...).
  char name[ULOC_FULLNAME_CAPACITY];
  UErrorCode error = U_ZERO_ERROR;
  uloc_getLocaleForLCID(langId, name, sizeof(name), &error);
  if (U_FAILURE(error)) return false;
  *pages = {CP_ACP, CP_OEMCP, CP_MACCP};
  return true;
}

LCID EnvironmentLcid() noexcept {
  const char* value = nullptr;
  for (const char* variable : {"LC_ALL", "LC_CTYPE", "LANG"}) {
    value = std::getenv(variable);
    if (value != nullptr && value[0] != '\0') break;
  }
  if (value == nullptr || value[0] == '\0') return kEnglishUs;
  // language[_territory][.codeset][@modifier]; glibc's @latin and @cyrillic name the script.
  std::string name(value);
  std::string modifier;
  if (const auto at = name.find('@'); at != std::string::npos) {
    modifier = name.substr(at + 1);
    name.erase(at);
  }
  if (const auto dot = name.find('.'); dot != std::string::npos) name.erase(dot);
  if (name.empty() || name == "C" || name == "POSIX") return kEnglishUs;
  if (modifier == "latin" || modifier == "cyrillic") {
    const std::string script = modifier == "latin" ? "_Latn" : "_Cyrl";
    name.insert(std::min(name.find('_'), name.size()), script);
  }
  LCID lcid = uloc_getLCID(name.c_str());
  if (lcid == 0) lcid = uloc_getLCID(name.substr(0, name.find('_')).c_str());
  if (lcid == 0) return kEnglishUs;
  if (lcid < 0x400) lcid |= 0x400;  // a bare language: its default sublanguage
  if (lcid == LOCALE_USER_DEFAULT || lcid == LOCALE_SYSTEM_DEFAULT) return kEnglishUs;
  return lcid;
}

}  // namespace win32::detail

namespace win32 {

namespace {
constexpr DWORD kLocaleNoUserOverride = 0x80000000;
constexpr DWORD kLocaleUseCpAcp = 0x40000000;

thread_local LCID t_threadLocale = 0;  // 0: not set, the user's locale
}  // namespace

LCID GetThreadLocale() { return t_threadLocale != 0 ? t_threadLocale : GetUserDefaultLCID(); }

BOOL SetThreadLocale(LCID locale) {
  if (locale == LOCALE_USER_DEFAULT || locale == LOCALE_SYSTEM_DEFAULT) {
    locale = GetUserDefaultLCID();
  }
  detail::LocaleCodePages pages;
  if (locale == 0 || !detail::CodePagesOfLocale(locale, &pages)) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
  }
  t_threadLocale = locale;
  return TRUE;
}

int GetLocaleInfoW(LCID Locale, DWORD LCType, MCHAR* lpLCData, int cchData) {
  if (cchData < 0 || (cchData > 0 && lpLCData == nullptr)) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return 0;
  }
  detail::LocaleCodePages pages;
  if (!detail::CodePagesOfLocale(Locale, &pages)) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return 0;
  }
  UINT value;
  switch (LCType & ~(kLocaleNoUserOverride | kLocaleUseCpAcp | LOCALE_RETURN_NUMBER)) {
    case LOCALE_IDEFAULTCODEPAGE: value = pages.oem; break;
    case LOCALE_IDEFAULTANSICODEPAGE: value = pages.ansi; break;
    case LOCALE_IDEFAULTMACCODEPAGE: value = pages.mac; break;
    default: SetLastError(ERROR_INVALID_FLAGS); return 0;
  }
  if (LCType & LOCALE_RETURN_NUMBER) {
    constexpr int kUnits = sizeof(DWORD) / sizeof(MCHAR);
    if (cchData == 0) return kUnits;
    if (cchData < kUnits) {
      SetLastError(ERROR_INSUFFICIENT_BUFFER);
      return 0;
    }
    const DWORD number = value;
    std::memcpy(lpLCData, &number, sizeof(number));
    return kUnits;
  }
  const std::string digits = std::to_string(value);
  const int needed = static_cast<int>(digits.size()) + 1;
  if (cchData == 0) return needed;
  if (cchData < needed) {
    SetLastError(ERROR_INSUFFICIENT_BUFFER);
    return 0;
  }
  for (std::size_t i = 0; i < digits.size(); ++i) lpLCData[i] = static_cast<MCHAR>(digits[i]);
  lpLCData[digits.size()] = 0;
  return needed;
}

}  // namespace win32
