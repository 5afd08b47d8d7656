// Windows runtime locale names: "C", "", "language[_country][.codepage]" with the runtime's
// English names and abbreviations, ".codepage" alone, and locale names such as "ja-JP". A name
// resolves to an ICU locale (for the decimal point), a Windows locale identifier (for the
// code pages) and the code page the name asks for.

#include <unicode/uloc.h>
#include <unicode/unum.h>

#include <cctype>
#include <charconv>
#include <string>
#include <string_view>

#include "codepage_locale.h"
#include "codepage_registry.h"
#include "crt_format_locale.h"
#include "win32/codepage.h"

namespace win32::detail {

namespace {

struct Alias {
  std::string_view name;  // lower case
  const char* icuId;
};

// The runtime's language strings and three-letter abbreviations that are not simply English
// language names, or that stand for one particular country.
constexpr Alias kLanguageAliases[] = {
    {"american", "en_US"},           {"american english", "en_US"},
    {"american-english", "en_US"},   {"english-american", "en_US"},
    {"english-us", "en_US"},         {"english-usa", "en_US"},
    {"english", "en_US"},            {"enu", "en_US"},
    {"us", "en_US"},                 {"usa", "en_US"},
    {"english-uk", "en_GB"},         {"uk", "en_GB"},
    {"eng", "en_GB"},                {"english-can", "en_CA"},
    {"canadian", "en_CA"},           {"english-aus", "en_AU"},
    {"australian", "en_AU"},         {"english-nz", "en_NZ"},
    {"english-ire", "en_IE"},        {"irish-english", "en_IE"},
    {"chinese", "zh_CN"},            {"chinese-simplified", "zh_CN"},
    {"chinese (simplified)", "zh_CN"}, {"chs", "zh_CN"},
    {"chinese-traditional", "zh_TW"}, {"chinese (traditional)", "zh_TW"},
    {"cht", "zh_TW"},                {"chinese-hongkong", "zh_HK"},
    {"chinese-singapore", "zh_SG"},  {"japanese", "ja_JP"},
    {"jpn", "ja_JP"},                {"korean", "ko_KR"},
    {"kor", "ko_KR"},                {"german", "de_DE"},
    {"deu", "de_DE"},                {"german-swiss", "de_CH"},
    {"swiss", "de_CH"},              {"german-austrian", "de_AT"},
    {"french", "fr_FR"},             {"fra", "fr_FR"},
    {"french-canadian", "fr_CA"},    {"french-swiss", "fr_CH"},
    {"french-belgian", "fr_BE"},     {"italian", "it_IT"},
    {"ita", "it_IT"},                {"spanish", "es_ES"},
    {"esp", "es_ES"},                {"spanish-mexican", "es_MX"},
    {"portuguese", "pt_PT"},         {"ptg", "pt_PT"},
    {"portuguese-brazilian", "pt_BR"}, {"ptb", "pt_BR"},
    {"russian", "ru_RU"},            {"rus", "ru_RU"},
    {"polish", "pl_PL"},             {"plk", "pl_PL"},
    {"czech", "cs_CZ"},              {"csy", "cs_CZ"},
    {"hungarian", "hu_HU"},          {"hun", "hu_HU"},
    {"turkish", "tr_TR"},            {"trk", "tr_TR"},
    {"greek", "el_GR"},              {"ell", "el_GR"},
    {"dutch", "nl_NL"},              {"nld", "nl_NL"},
    {"dutch-belgian", "nl_BE"},      {"swedish", "sv_SE"},
    {"sve", "sv_SE"},                {"danish", "da_DK"},
    {"dan", "da_DK"},                {"finnish", "fi_FI"},
    {"fin", "fi_FI"},                {"norwegian", "nb_NO"},
    {"norwegian-bokmal", "nb_NO"},   {"nor", "nb_NO"},
    {"norwegian-nynorsk", "nn_NO"},  {"non", "nn_NO"},
};

// Country names the runtime uses that differ from ICU's English names.
constexpr Alias kCountryAliases[] = {
    {"korea", "KR"},          {"people's republic of china", "CN"},
    {"prc", "CN"},            {"taiwan", "TW"},
    {"hong kong sar", "HK"},  {"hong kong", "HK"},
    {"macao sar", "MO"},      {"britain", "GB"},
    {"great britain", "GB"},  {"uk", "GB"},
    {"usa", "US"},            {"us", "US"},
    {"america", "US"},
};

std::string Lower(std::string_view text) {
  std::string lower(text);
  for (char& c : lower) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return lower;
}

const char* FindAlias(const Alias* begin, const Alias* end, const std::string& lower) {
  for (const Alias* a = begin; a != end; ++a) {
    if (a->name == lower) return a->icuId;
  }
  return nullptr;
}

std::string DisplayLanguage(const char* code) {
  UChar name[64];
  UErrorCode status = U_ZERO_ERROR;
  const int32_t n = uloc_getDisplayLanguage(code, "en", name, 64, &status);
  if (U_FAILURE(status) || n <= 0 || n >= 64) return {};
  std::string ascii(static_cast<std::size_t>(n), '\0');
  for (int32_t i = 0; i < n; ++i) {
    ascii[static_cast<std::size_t>(i)] = name[i] < 0x80 ? static_cast<char>(name[i]) : '?';
  }
  return Lower(ascii);
}

// The ISO 639 code whose English name is `lower` ("thai" -> "th").
std::string LanguageByEnglishName(const std::string& lower) {
  for (const char* const* code = uloc_getISOLanguages(); *code != nullptr; ++code) {
    if (DisplayLanguage(*code) == lower) return *code;
  }
  return {};
}

// The ISO 3166 code whose English name (or the runtime's name) is `lower`.
std::string CountryByEnglishName(const std::string& lower) {
  if (const char* alias = FindAlias(std::begin(kCountryAliases), std::end(kCountryAliases), lower)) {
    return alias;
  }
  for (const char* const* code = uloc_getISOCountries(); *code != nullptr; ++code) {
    const std::string id = std::string("und_") + *code;
    UChar name[96];
    UErrorCode status = U_ZERO_ERROR;
    const int32_t n = uloc_getDisplayCountry(id.c_str(), "en", name, 96, &status);
    if (U_FAILURE(status) || n <= 0 || n >= 96) continue;
    std::string ascii;
    for (int32_t i = 0; i < n; ++i) ascii += name[i] < 0x80 ? static_cast<char>(name[i]) : '?';
    if (Lower(ascii) == lower) return *code;
  }
  return {};
}

// "language_COUNTRY" for a language with its most likely country ("th" -> "th_TH").
std::string WithLikelyCountry(const std::string& id) {
  char maximized[ULOC_FULLNAME_CAPACITY];
  UErrorCode status = U_ZERO_ERROR;
  uloc_addLikelySubtags(id.c_str(), maximized, sizeof(maximized), &status);
  if (U_FAILURE(status)) return id;
  char language[ULOC_LANG_CAPACITY];
  char country[ULOC_COUNTRY_CAPACITY];
  uloc_getLanguage(maximized, language, sizeof(language), &status);
  uloc_getCountry(maximized, country, sizeof(country), &status);
  if (U_FAILURE(status) || country[0] == '\0') return id;
  return std::string(language) + "_" + country;
}

// The ICU locale of a language part ("Japanese", "English_United States", "ja-JP"); empty when
// the name is not a locale the runtime knows.
std::string IcuLocaleOf(std::string_view languagePart) {
  const std::string lower = Lower(languagePart);
  if (const char* alias = FindAlias(std::begin(kLanguageAliases), std::end(kLanguageAliases), lower)) {
    return alias;
  }
  // Locale names (BCP 47): "ja-JP", "de".
  if (lower.find('_') == std::string::npos) {
    char id[ULOC_FULLNAME_CAPACITY];
    int32_t parsed = 0;
    UErrorCode status = U_ZERO_ERROR;
    uloc_forLanguageTag(lower.c_str(), id, sizeof(id), &parsed, &status);
    if (U_SUCCESS(status) && parsed == static_cast<int32_t>(lower.size()) && id[0] != '\0') {
      char language[ULOC_LANG_CAPACITY];
      uloc_getLanguage(id, language, sizeof(language), &status);
      if (U_SUCCESS(status) && DisplayLanguage(language) != language) {
        return lower.find('-') == std::string::npos ? WithLikelyCountry(id) : std::string(id);
      }
    }
  }
  // English names, optionally with an English country name.
  const std::size_t underscore = lower.find('_');
  const std::string language = lower.substr(0, underscore);
  std::string base;
  if (const char* alias = FindAlias(std::begin(kLanguageAliases), std::end(kLanguageAliases), language)) {
    base = alias;
    base = base.substr(0, base.find('_'));
  } else {
    base = LanguageByEnglishName(language);
  }
  if (base.empty()) return {};
  if (underscore == std::string::npos) {
    const char* alias = FindAlias(std::begin(kLanguageAliases), std::end(kLanguageAliases), language);
    return alias != nullptr ? std::string(alias) : WithLikelyCountry(base);
  }
  const std::string country = CountryByEnglishName(lower.substr(underscore + 1));
  if (country.empty()) return {};
  return base + "_" + country;
}

// Code pages a runtime locale can use for multi-byte text.
bool UsableCodePage(UINT codePage) {
  const CodePageEntry* entry = FindCodePage(codePage);
  return entry != nullptr && (entry->kind == CodePageKind::kSingleByte ||
                              entry->kind == CodePageKind::kDoubleByte ||
                              entry->kind == CodePageKind::kUtf8);
}

char DecimalPointOf(const std::string& icuId) {
  UErrorCode status = U_ZERO_ERROR;
  UNumberFormat* format = unum_open(UNUM_DECIMAL, nullptr, 0, icuId.c_str(), nullptr, &status);
  if (U_FAILURE(status)) return '.';
  UChar symbol[8];
  const int32_t n = unum_getSymbol(format, UNUM_DECIMAL_SEPARATOR_SYMBOL, symbol, 8, &status);
  unum_close(format);
  // A separator outside ASCII (Arabic, Persian) has no single-byte form in every code page; the
  // runtime's own data uses '.' for those locales' legacy code pages too.
  if (U_FAILURE(status) || n != 1 || symbol[0] >= 0x80) return '.';
  return static_cast<char>(symbol[0]);
}

// The code page named after the '.', for a language with the given code pages.
bool ParseCodePage(std::string_view text, const LocaleCodePages& pages, UINT* codePage) {
  const std::string lower = Lower(text);
  if (lower == "acp") {
    *codePage = pages.ansi;
  } else if (lower == "ocp") {
    *codePage = pages.oem;
  } else if (lower == "utf8" || lower == "utf-8") {
    *codePage = CP_UTF8;
  } else {
    UINT number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size()) return false;
    *codePage = number;
  }
  return true;
}

}  // namespace

bool ResolveLocaleName(std::string_view name, ResolvedLocaleName* resolved) {
  if (name == "C") {
    *resolved = {kCLocaleCodePage, true, '.'};
    return true;
  }
  std::string_view languagePart = name;
  std::string_view codePagePart;
  bool hasCodePage = false;
  if (const std::size_t dot = name.rfind('.'); dot != std::string_view::npos) {
    languagePart = name.substr(0, dot);
    codePagePart = name.substr(dot + 1);
    hasCodePage = true;
  }

  std::string icuId;
  LocaleCodePages pages{};
  if (languagePart.empty()) {
    // The user's language; its code pages are the process's.
    char id[ULOC_FULLNAME_CAPACITY];
    UErrorCode status = U_ZERO_ERROR;
    uloc_getLocaleForLCID(EnvironmentLcid(), id, sizeof(id), &status);
    icuId = U_SUCCESS(status) ? id : "en_US";
    pages = {GetACP(), GetOEMCP(), CP_MACCP};
  } else {
    icuId = IcuLocaleOf(languagePart);
    if (icuId.empty()) return false;
    const LCID lcid = uloc_getLCID(icuId.c_str());
    if (lcid == 0 || !CodePagesOfLocale(lcid, &pages)) return false;
  }

  UINT codePage = pages.ansi;
  if (hasCodePage && !ParseCodePage(codePagePart, pages, &codePage)) return false;
  if (!UsableCodePage(codePage)) return false;  // also a Unicode-only language without ".utf8"
  *resolved = {codePage, false, DecimalPointOf(icuId)};
  return true;
}

}  // namespace win32::detail
