// The user-interface language: an environment override, else the process locale's language; a
// thread may choose its own.

#include "win32/language.h"

#include <unicode/uloc.h>

#include <cstdlib>
#include <cstring>
#include <string>

namespace win32::detail {

namespace {

constexpr LANGID kEnglishUnitedStates = 0x0409;

// TAVLO_PLATFORM_LANGID as a number (decimal or 0x-hexadecimal); 0 when unset or malformed.
LANGID LanguageFromVariable() {
  const char* value = std::getenv("TAVLO_PLATFORM_LANGID");
  if (value == nullptr || value[0] == '\0') return 0;
  const bool hex = value[0] == '0' && (value[1] == 'x' || value[1] == 'X');
  const char* digits = hex ? value + 2 : value;
  if (*digits == '\0' || std::strlen(digits) > 8) return 0;
  char* end = nullptr;
  const unsigned long number = std::strtoul(digits, &end, hex ? 16 : 10);
  if (*end != '\0' || digits[0] == '+' || digits[0] == '-' || number > 0xFFFF) return 0;
  return static_cast<LANGID>(number);
}

// The locale name that decides the messages' language, as setlocale would pick it.
const char* MessagesLocaleName() {
  for (const char* variable : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
    const char* value = std::getenv(variable);
    if (value != nullptr && value[0] != '\0') return value;
  }
  return nullptr;
}

std::string LanguageAndRegion(const char* canonical) {
  char language[ULOC_LANG_CAPACITY] = {};
  char region[ULOC_COUNTRY_CAPACITY] = {};
  UErrorCode error = U_ZERO_ERROR;
  uloc_getLanguage(canonical, language, sizeof(language), &error);
  uloc_getCountry(canonical, region, sizeof(region), &error);
  if (U_FAILURE(error)) return {};
  std::string name = language;
  if (region[0] != '\0') name.append("_").append(region);
  return name;
}

}  // namespace

LANGID LanguageOfLocaleName(const char* name) noexcept {
  if (name == nullptr) return 0;
  char canonical[ULOC_FULLNAME_CAPACITY] = {};
  UErrorCode error = U_ZERO_ERROR;
  // ICU drops the codeset and turns "de_DE@euro" into "de_DE_EURO"; C and POSIX become "c"/"posix".
  uloc_canonicalize(name, canonical, sizeof(canonical), &error);
  if (U_FAILURE(error)) return 0;
  std::string languageRegion = LanguageAndRegion(canonical);
  if (languageRegion.empty()) return 0;
  if (languageRegion.find('_') == std::string::npos) {
    // A bare language: the region it is most likely used in ("ja" -> "ja_Jpan_JP").
    char likely[ULOC_FULLNAME_CAPACITY] = {};
    error = U_ZERO_ERROR;
    uloc_addLikelySubtags(languageRegion.c_str(), likely, sizeof(likely), &error);
    if (U_SUCCESS(error)) {
      std::string withRegion = LanguageAndRegion(likely);
      if (!withRegion.empty()) languageRegion = withRegion;
    }
  }
  const uint32_t lcid = uloc_getLCID(languageRegion.c_str());
  return static_cast<LANGID>(lcid & 0xFFFF);
}

}  // namespace win32::detail

namespace win32 {

namespace {
thread_local LANGID t_threadUILanguage = 0;  // 0: follow the user's default
}

LANGID GetUserDefaultUILanguage() {
  if (LANGID forced = detail::LanguageFromVariable()) return forced;
  LANGID language = detail::LanguageOfLocaleName(detail::MessagesLocaleName());
  return language != 0 ? language : detail::kEnglishUnitedStates;
}

LANGID GetThreadUILanguage() {
  return t_threadUILanguage != 0 ? t_threadUILanguage : GetUserDefaultUILanguage();
}

LANGID SetThreadUILanguage(LANGID language) {
  t_threadUILanguage = language;
  return GetThreadUILanguage();
}

}  // namespace win32
