// The process's active (ANSI) and OEM code pages and the user's locale. They come from the
// environment's locale (read with newlocale, so the process locale is not touched) unless
// TAVLO_PLATFORM_ACP / TAVLO_PLATFORM_OEMCP name a code page; everything is read once, and
// SetProcessCodePages pins values over it.

#include <langinfo.h>
#include <locale.h>

#include <atomic>
#include <cctype>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <string>

#include "codepage_locale.h"
#include "codepage_registry.h"
#include "win32/codepage.h"

namespace win32 {

namespace {

struct CharsetCodePage {
  const char* charset;  // upper case, without '-' and '_'
  UINT codePage;
};

// The Windows ANSI code page of a locale's character set.
constexpr CharsetCodePage kCharsets[] = {
    {"UTF8", CP_UTF8},  {"ANSIX3.41968", 1252}, {"ASCII", 1252},     {"USASCII", 1252},
    {"ISO88591", 1252}, {"ISO885915", 1252},    {"CP1252", 1252},    {"ISO88592", 1250},
    {"CP1250", 1250},   {"ISO88595", 1251},     {"KOI8R", 1251},     {"KOI8U", 1251},
    {"CP1251", 1251},   {"ISO88597", 1253},     {"ISO88599", 1254},  {"ISO88598", 1255},
    {"ISO88596", 1256}, {"ISO88594", 1257},     {"ISO885913", 1257}, {"TIS620", 874},
    {"ISO885911", 874}, {"CP1258", 1258},       {"TCVN57121", 1258}, {"EUCJP", 932},
    {"SHIFTJIS", 932},  {"SJIS", 932},          {"GB2312", 936},     {"GBK", 936},
    {"GB18030", 936},   {"EUCCN", 936},         {"EUCKR", 949},      {"BIG5", 950},
    {"BIG5HKSCS", 950}, {"EUCTW", 950},
};

// The OEM code page Windows pairs with an ANSI code page.
struct AnsiOem {
  UINT ansi;
  UINT oem;
};
constexpr AnsiOem kOemOfAnsi[] = {
    {874, 874},  {932, 932},  {936, 936},  {949, 949},   {950, 950},
    {1250, 852}, {1251, 866}, {1252, 437}, {1253, 737},  {1254, 857},
    {1255, 862}, {1256, 720}, {1257, 775}, {1258, 1258}, {CP_UTF8, CP_UTF8},
};

constexpr UINT kFallbackAcp = 1252;

UINT CodePageOfCharset(const char* charset) {
  std::string key;
  for (const char* p = charset; *p != '\0'; ++p) {
    if (*p != '-' && *p != '_')
      key.push_back(static_cast<char>(std::toupper(static_cast<unsigned char>(*p))));
  }
  for (const CharsetCodePage& entry : kCharsets) {
    if (key == entry.charset) return entry.codePage;
  }
  return kFallbackAcp;
}

// The code page named by an environment variable: decimal digits naming a code page this layer
// converts; 0 otherwise.
UINT CodePageFromVariable(const char* name) {
  const char* value = std::getenv(name);
  if (value == nullptr || value[0] == '\0' || std::strlen(value) > 9) return 0;
  UINT codePage = 0;
  for (const char* p = value; *p != '\0'; ++p) {
    if (*p < '0' || *p > '9') return 0;
    codePage = codePage * 10 + static_cast<UINT>(*p - '0');
  }
  return detail::FindCodePage(codePage) != nullptr ? codePage : 0;
}

UINT AcpFromLocale() {
  locale_t locale = newlocale(LC_CTYPE_MASK, "", static_cast<locale_t>(nullptr));
  if (locale != static_cast<locale_t>(nullptr)) {
    const UINT codePage = CodePageOfCharset(nl_langinfo_l(CODESET, locale));
    freelocale(locale);
    return codePage;
  }
  // The locale is not installed: take the character set its name gives, if any.
  for (const char* variable : {"LC_ALL", "LC_CTYPE", "LANG"}) {
    const char* value = std::getenv(variable);
    if (value == nullptr || value[0] == '\0') continue;
    const char* dot = std::strchr(value, '.');
    if (dot == nullptr) return kFallbackAcp;
    return CodePageOfCharset(std::string(dot + 1, std::strcspn(dot + 1, "@")).c_str());
  }
  return kFallbackAcp;
}

UINT OemOfAnsi(UINT acp, LCID userLocale) {
  detail::LocaleCodePages pages;
  if (detail::CodePagesOfLocale(userLocale, &pages) && pages.ansi == acp &&
      pages.oem > CP_THREAD_ACP) {
    return pages.oem;  // the locale's own pairing (850 for German, 437 for US English)
  }
  for (const AnsiOem& pair : kOemOfAnsi) {
    if (pair.ansi == acp) return pair.oem;
  }
  return 437;
}

struct Snapshot {
  std::atomic<bool> loaded{false};
  std::atomic<UINT> acp{0};
  std::atomic<UINT> oemcp{0};
  std::atomic<LCID> userLocale{0};
  std::mutex mutex;
};

Snapshot& TheSnapshot() {
  static Snapshot snapshot;
  return snapshot;
}

std::atomic<UINT> g_pinnedAcp{0};
std::atomic<UINT> g_pinnedOemcp{0};

const Snapshot& Loaded() {
  Snapshot& s = TheSnapshot();
  if (s.loaded.load(std::memory_order_acquire)) return s;
  std::lock_guard<std::mutex> lock(s.mutex);
  if (!s.loaded.load(std::memory_order_relaxed)) {
    const LCID userLocale = detail::EnvironmentLcid();
    UINT acp = CodePageFromVariable("TAVLO_PLATFORM_ACP");
    if (acp == 0) acp = AcpFromLocale();
    UINT oemcp = CodePageFromVariable("TAVLO_PLATFORM_OEMCP");
    if (oemcp == 0) oemcp = OemOfAnsi(acp, userLocale);
    s.userLocale.store(userLocale, std::memory_order_relaxed);
    s.acp.store(acp, std::memory_order_relaxed);
    s.oemcp.store(oemcp, std::memory_order_relaxed);
    s.loaded.store(true, std::memory_order_release);
  }
  return s;
}

UINT PinnableOrZero(UINT codePage) {
  return detail::FindCodePage(codePage) != nullptr ? codePage : 0;
}

}  // namespace

UINT GetACP() {
  const UINT pinned = g_pinnedAcp.load(std::memory_order_relaxed);
  return pinned != 0 ? pinned : Loaded().acp.load(std::memory_order_relaxed);
}

UINT GetOEMCP() {
  const UINT pinned = g_pinnedOemcp.load(std::memory_order_relaxed);
  return pinned != 0 ? pinned : Loaded().oemcp.load(std::memory_order_relaxed);
}

void SetProcessCodePages(UINT acp, UINT oemcp) {
  g_pinnedAcp.store(PinnableOrZero(acp), std::memory_order_relaxed);
  g_pinnedOemcp.store(PinnableOrZero(oemcp), std::memory_order_relaxed);
}

void ReloadProcessCodePages() {
  Snapshot& s = TheSnapshot();
  std::lock_guard<std::mutex> lock(s.mutex);
  s.loaded.store(false, std::memory_order_release);
}

LCID GetUserDefaultLCID() { return Loaded().userLocale.load(std::memory_order_relaxed); }

}  // namespace win32
