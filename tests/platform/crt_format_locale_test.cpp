// Runtime locales (_create_locale) and what they change in formatting: the code page of narrow
// text in wide formats and of wide text in narrow formats, and the decimal point.
//
// Sources: "_create_locale, _wcreate_locale" and "Language strings" / "Country/Region strings"
// / "Code pages" of the Microsoft C runtime documentation (names, ".codepage", ".ACP", ".OCP",
// ".utf8"); the code pages' own tables for the byte values (Shift_JIS 日 = 93 FA, 本 = 96 7B;
// windows-1252 0x80 = EURO SIGN); the "C" locale's one-to-one byte mapping.

#include "win32/crt_format.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstdarg>
#include <string>
#include <vector>

#include "win32/codepage.h"

namespace {

using namespace win32;

// A locale that frees itself.
struct Locale {
  explicit Locale(const char* name, int category = LC_ALL_CRT) : handle(_create_locale(category, name)) {}
  ~Locale() { _free_locale(handle); }
  Locale(const Locale&) = delete;
  _locale_t handle;
};

std::u16string WideL(_locale_t locale, const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  const int length = _vscwprintf_l(format, locale, args);
  std::vector<MCHAR> buffer(64);
  const int written = _vsnwprintf_s_l(buffer.data(), buffer.size(), _TRUNCATE, format, locale, args);
  va_end(args);
  EXPECT_EQ(written, length);
  return written >= 0 ? std::u16string(buffer.data()) : u"<" + std::u16string(buffer.data()) + u"-1>";
}

std::string NarrowL(_locale_t locale, const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int length = _vscprintf_l(format, locale, args);
  std::vector<char> buffer(64);
  const int written = _vsnprintf_s_l(buffer.data(), buffer.size(), _TRUNCATE, format, locale, args);
  va_end(args);
  EXPECT_EQ(written, length);
  return written >= 0 ? std::string(buffer.data()) : "<" + std::string(buffer.data()) + "-1>";
}

TEST(CrtLocale, NamesResolveToTheirCodePages) {
  struct Row {
    const char* name;
    int category;
    UINT codePage;  // 0: no locale
  };
  constexpr int kAll = LC_ALL_CRT;
  const Row rows[] = {
      {"C", kAll, 28591},          {"Japanese", kAll, 932},     {"japanese", kAll, 932},
      {"jpn", kAll, 932},          {"chinese-simplified", kAll, 936},
      {"chinese-traditional", kAll, 950},                       {"chinese", kAll, 936},
      {"korean", kAll, 949},       {"Korean_Korea.949", kAll, 949},
      {"English_United States.1252", kAll, 1252},               {"German_Germany", kAll, 1252},
      {"Chinese (Simplified)_China.936", kAll, 936},            {"Russian", kAll, 1251},
      {"Thai", kAll, 874},         {"ja-JP", kAll, 932},        {"ko", kAll, 949},
      {"English.ACP", kAll, 1252},
      {"English.OCP", kAll, 437},  {"Japanese.utf8", kAll, 65001},
      {".932", kAll, 932},         {".UTF-8", kAll, 65001},     {"Hindi.utf8", kAll, 65001},
      {"", kAll, 1252},  // the user's locale with the process's code page (pinned to 1252)
      {"Japanese", LC_CTYPE_CRT, 932},
      {"Japanese", LC_NUMERIC_CRT, 28591},  // the character type stays "C"
      // Refused:
      {"Hindi", kAll, 0},  // a Unicode-only language has no ANSI code page
      {"Klingon", kAll, 0},        {"English_Narnia", kAll, 0}, {"Japanese.12345", kAll, 0},
      {".50220", kAll, 0},  // ISO-2022 keeps shift states: not a multi-byte code page
      {".65000", kAll, 0},         {"Japanese.", kAll, 0},
      {"Japanese", 6, 0},  // glibc's LC_ALL is not a runtime category
      {"Japanese", -1, 0},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(std::string("\"") + row.name + "\" category " + std::to_string(row.category));
    errno = 0;
    Locale locale(row.name, row.category);
    if (row.codePage == 0) {
      EXPECT_EQ(locale.handle, nullptr);
      EXPECT_EQ(errno, EINVAL);
    } else {
      ASSERT_NE(locale.handle, nullptr);
      EXPECT_EQ(LocaleCodePage(locale.handle), row.codePage);
    }
  }
  EXPECT_EQ(_create_locale(LC_ALL_CRT, nullptr), nullptr);
  EXPECT_EQ(LocaleCodePage(nullptr), GetACP());
  _free_locale(nullptr);
}

TEST(CrtLocale, TheNumericCategoryGivesTheDecimalPoint) {
  Locale german("German_Germany.1252");
  Locale germanCharType("German", LC_CTYPE_CRT);
  Locale germanNumeric("German", LC_NUMERIC_CRT);
  Locale japanese("Japanese");
  EXPECT_EQ(NarrowL(german.handle, "%.2f %e", 3.14159, 0.5), "3,14 5,000000e-01");
  EXPECT_EQ(NarrowL(germanNumeric.handle, "%g", 0.25), "0,25");
  EXPECT_EQ(WideL(german.handle, u"%#.0f %a", 2.0, 1.0), u"2, 0x1,0000000000000p+0");
  EXPECT_EQ(NarrowL(germanCharType.handle, "%.2f", 3.14159), "3.14");
  EXPECT_EQ(NarrowL(japanese.handle, "%.2f", 3.14159), "3.14");
  EXPECT_EQ(NarrowL(nullptr, "%.2f", 3.14159), "3.14");
}

TEST(CrtLocale, ShiftJisTextInWideAndNarrowFormats) {
  Locale japanese("Japanese");
  ASSERT_NE(japanese.handle, nullptr);
  const char* nihon = "\x93\xFA\x96\x7B";  // 日本 in Shift_JIS
  EXPECT_EQ(WideL(japanese.handle, u"%S|%hs", nihon, nihon), u"\u65E5\u672C|\u65E5\u672C");
  EXPECT_EQ(WideL(japanese.handle, u"[%5S][%-4S]", nihon, nihon), u"[   \u65E5\u672C][\u65E5\u672C  ]")
      << "widths count output characters";
  EXPECT_EQ(WideL(japanese.handle, u"[%.3S][%.1S]", nihon, nihon), u"[\u65E5][]")
      << "a precision counts bytes; a character it splits is left out";
  EXPECT_EQ(WideL(japanese.handle, u"%C%C", 'A', '\xB1'), u"A\uFF71") << "half-width katakana byte";
  EXPECT_EQ(WideL(japanese.handle, u"[%C]", '\x93'), u"[]") << "a lone lead byte is no character: left out";
  EXPECT_EQ(NarrowL(japanese.handle, "%ls|%S", u"\u65E5\u672C", u"\u65E5"), "\x93\xFA\x96\x7B|\x93\xFA");
  EXPECT_EQ(NarrowL(japanese.handle, "%C%lc", u'\u672C', u'x'), "\x96\x7Bx");
  EXPECT_EQ(NarrowL(japanese.handle, "[%C]", u'\u0E01'), "[]") << "THAI CHARACTER KO KAI: not in 932";

  errno = 0;
  EXPECT_EQ(WideL(japanese.handle, u"ab%S", "\x93"), u"<-1>") << "a string with a lone lead byte fails";
  EXPECT_EQ(errno, EILSEQ);
  EXPECT_EQ(NarrowL(japanese.handle, "ab%ls", u"\u0E01"), "<-1>") << "a wide string 932 cannot hold fails";
}

TEST(CrtLocale, TheCLocaleMapsBytesOneToOne) {
  Locale c("C");
  EXPECT_EQ(WideL(c.handle, u"%S", "caf\xE9\x80"), u"caf\u00E9\u0080");
  EXPECT_EQ(NarrowL(c.handle, "%ls", u"caf\u00E9"), "caf\xE9");
  EXPECT_EQ(NarrowL(c.handle, "%ls", u"\u0100"), "<-1>") << "above U+00FF, no best fit";
}

TEST(CrtLocale, Utf8Locale) {
  Locale utf8(".utf8");
  EXPECT_EQ(WideL(utf8.handle, u"%S|%.1S|%.2S", "caf\xC3\xA9", "\xC3\xA9", "\xC3\xA9"), u"caf\u00E9||\u00E9");
  EXPECT_EQ(NarrowL(utf8.handle, "%ls", u"\U0001F600"), "\xF0\x9F\x98\x80");
  EXPECT_EQ(NarrowL(utf8.handle, "%.1ls|", u"\U0001F600"), "|") << "a cut surrogate pair is left out";
  EXPECT_EQ(NarrowL(utf8.handle, "%ls", u"a\xD800"), "<-1>") << "a lone surrogate has no UTF-8 form";
  EXPECT_EQ(WideL(utf8.handle, u"%S", "\xFF"), u"<-1>");
}

TEST(CrtLocale, WithoutALocaleTheActiveCodePageConverts) {
  // The test process runs with the active code page pinned to 1252.
  EXPECT_EQ(WideL(nullptr, u"%S", "\x80"), u"\u20AC");
  EXPECT_EQ(NarrowL(nullptr, "%ls", u"\u20AC"), "\x80");
  EXPECT_EQ(NarrowL(nullptr, "%ls", u"\uFF21"), "A") << "1252 encodes with Windows' best fit";
  EXPECT_EQ(NarrowL(nullptr, "%ls", u"\u221E"), "<-1>") << "INFINITY has no 1252 form, not even a best fit";
  SetProcessCodePages(932, 932);
  EXPECT_EQ(WideL(nullptr, u"%S", "\x93\xFA"), u"\u65E5");
  SetProcessCodePages(0, 0);
  EXPECT_EQ(WideL(nullptr, u"%S", "\x93\xFA"), u"\u201C\u00FA");
}

}  // namespace
