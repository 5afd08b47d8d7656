// CStr, WStr and UTF8Str: formatted printing. Results and texts as the Windows runtime's
// _vsnwprintf_s / _vsnprintf_s give them (learn.microsoft.com, the printf format-syntax page).

#include <gtest/gtest.h>

#include <string>

#include "vynutil/strclass.h"
#include "win32/crt_format.h"

TEST(StrPrintf, PrintsIntoANewBlockOfExactSize) {
  WStr w;
  EXPECT_EQ(w.printf(u"%d", 42), 2);
  EXPECT_EQ(w, u"42");
  EXPECT_EQ(w.AllocatedChars(), 3u) << "count + 1 units";

  WStr shared(u"old");
  WStr other = shared;
  EXPECT_EQ(shared.printf(u"%s-%04x", u"id", 0xBEEFu), 7);
  EXPECT_EQ(shared, u"id-beef");
  EXPECT_EQ(other, u"old") << "the old block is released, never written";

  CStr c;
  EXPECT_EQ(c.printf("%5.1f|%-3d|%c", 2.25, 7, 'z'), 11);
  EXPECT_EQ(c, "  2.2|7  |z") << "round-half-even of the binary value 2.25";

  std::u16string longText(5000, u'w');
  EXPECT_EQ(w.printf(u"<%s>", longText.c_str()), 5002);
  EXPECT_EQ(w.Length(), 5002);
}

TEST(StrPrintf, NullAndInvalidFormatsLeaveTheText) {
  const struct {
    const char* name;
    const MCHAR* wide;
    const char* narrow;
  } rows[] = {
      {"null format: -1", nullptr, nullptr},
      {"%n is refused", u"%n", "%n"},
      {"format ends inside a conversion", u"abc%", "abc%"},
      {"unknown conversion", u"%y", "%y"},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    int sink = 0;
    WStr w(u"before");
    CStr c("before");
    UTF8Str u("before");
    for (const int result : {w.printf(row.wide, &sink), c.printf(row.narrow, &sink), u.printf(row.narrow, &sink)}) {
      EXPECT_TRUE(row.wide == nullptr ? result == -1 : result < 0) << result;
    }
    EXPECT_EQ(w, u"before");
    EXPECT_EQ(c, "before");
    EXPECT_EQ(u, UTF8Str("before"));
  }
  WStr w(u"keep");
  EXPECT_EQ(w.printf(WStr(), 1), -1) << "a null format passed as WStr";
  EXPECT_EQ(w, u"keep");
}

TEST(StrPrintf, WideAndNarrowStringArguments) {
  // Wide formats: %s and %c are MCHAR, %S and %C narrow; %hs always narrow, %ls always wide.
  WStr w;
  EXPECT_EQ(w.printf(u"%s|%S|%hs|%ls|%c%C", u"w\u00E9", "n\xE9", "h", u"l", u'\u20AC', 'x'), 12);
  EXPECT_EQ(w, u"w\u00E9|n\u00E9|h|l|\u20ACx");
  // Narrow formats: %s and %c narrow, %S and %C wide (converted to the active code page, 1252).
  CStr c;
  EXPECT_EQ(c.printf("%s|%S|%C", "n", u"w\u00E9", u'\u20AC'), 6);
  EXPECT_EQ(c, "n|w\xE9|\x80");
  // The format may be a string of the class itself, passed by value.
  EXPECT_EQ(w.printf(WStr(u"[%d]"), 5), 3);
  EXPECT_EQ(w, u"[5]");
  EXPECT_EQ(c.printf(CStr("[%s]"), "x"), 3);
  EXPECT_EQ(c, "[x]");
}

TEST(StrPrintf, Utf8StrFormatsNarrowTextAndHoldsItsUtf8Form) {
  UTF8Str u;
  // Format and narrow arguments are narrow code-page text (1252 here): 0xE9 is é.
  EXPECT_EQ(u.printf("caf%s %d", "\xE9", 3), 6) << "the result counts narrow units";
  EXPECT_EQ(std::string(u.data()), "caf\xC3\xA9 3");
  EXPECT_EQ(u.ToVynString().PrimaryCP(), 1252u);
  EXPECT_EQ(u.printf(UTF8Str("<%S>"), u"\u20AC"), 3);
  EXPECT_EQ(std::string(u.data()), "<\xE2\x82\xAC>");
}

TEST(StrPrintf, LocaleFormsUseTheGivenLocale) {
  _locale_t japanese = win32::_create_locale(win32::LC_ALL_CRT, "Japanese");
  ASSERT_NE(japanese, nullptr);
  // Narrow text in a wide format is decoded with the locale's code page: 93 FA 96 7B is 日本 in
  // code page 932.
  WStr w;
  EXPECT_EQ(w.printf_l(u"%S", japanese, "\x93\xFA\x96\x7B"), 2);
  EXPECT_EQ(w, u"\u65E5\u672C");
  CStr c;
  EXPECT_EQ(c.printf_l("%S", japanese, u"\u65E5\u672C"), 4);
  EXPECT_EQ(std::string(c.data()), "\x93\xFA\x96\x7B");
  win32::_free_locale(japanese);
}
