// The narrow code page follows the application's language, fixed once per process; each row runs
// in a child process started with that language.

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "strings/narrow_codepage.h"
#include "support/child_process.h"
#include "vynutil/strclass.h"
#include "win32/crt_format.h"

using VynSDK::Util::CStrCodePage;
using VynSDK::Util::CStrLocale;
using VynSDK::Util::CStrMultiLanguageMode;

namespace {

struct LanguageRow {
  const char* name;
  vyn::test::EnvironmentVariables env;
  UINT codePage;  // CStrCodePage: 0 (CP_ACP) or the double-byte code page
};

// Rows naming the language by TAVLO_PLATFORM_LANGID (LANGID values: [MS-LCID]) or, without it,
// by the messages locale.
const LanguageRow kRows[] = {
    {"Japanese", {{"TAVLO_PLATFORM_LANGID", "0x0411"}}, 932},
    {"ChineseSimplified", {{"TAVLO_PLATFORM_LANGID", "0x0804"}}, 936},
    {"ChineseTraditional", {{"TAVLO_PLATFORM_LANGID", "1028"}}, 936},  // primary language 4
    {"Korean", {{"TAVLO_PLATFORM_LANGID", "0x0412"}}, 949},
    {"German", {{"TAVLO_PLATFORM_LANGID", "0x0407"}}, CP_ACP},
    {"JapaneseFromLang",
     {{"TAVLO_PLATFORM_LANGID", ""}, {"LC_ALL", ""}, {"LC_MESSAGES", ""}, {"LANG", "ja_JP.UTF-8"}},
     932},
    {"KoreanFromLcMessages",
     {{"TAVLO_PLATFORM_LANGID", ""}, {"LC_ALL", ""}, {"LC_MESSAGES", "ko_KR.EUC-KR"}, {"LANG", "C"}},
     949},
    {"CLocale", {{"TAVLO_PLATFORM_LANGID", ""}, {"LC_ALL", "C"}}, CP_ACP},
};

class NarrowCodePage : public testing::TestWithParam<LanguageRow> {};

// In the child: the narrow code page, locale and mode, and CStr text tagged and converted with
// that code page.
void CheckLanguage(const LanguageRow& row) {
  const bool doubleByte = row.codePage != CP_ACP;
  EXPECT_EQ(CStrCodePage(), row.codePage);
  EXPECT_EQ(CStrMultiLanguageMode(), doubleByte);
  if (doubleByte) {
    ASSERT_NE(CStrLocale(), nullptr);
    EXPECT_EQ(win32::LocaleCodePage(CStrLocale()), row.codePage);
  } else {
    EXPECT_EQ(CStrLocale(), nullptr);
  }
  const UINT tag = doubleByte ? row.codePage : 1252;  // the test main pins the active code page
  CStr narrow("abc");
  EXPECT_EQ(narrow.ToVynString().PrimaryCP(), tag);
  EXPECT_EQ(WStr(u"x").ToCStr().ToVynString().ConversionCount(), 2u);
}

}  // namespace

TEST_P(NarrowCodePage, FollowsTheApplicationLanguage) {
  if (!vyn::test::InChildProcess()) {
    EXPECT_TRUE(vyn::test::RunCurrentTestInChild(GetParam().env));
    return;
  }
  CheckLanguage(GetParam());
}

INSTANTIATE_TEST_SUITE_P(Languages, NarrowCodePage, testing::ValuesIn(kRows),
                         [](const testing::TestParamInfo<LanguageRow>& info) { return std::string(info.param.name); });

TEST(NarrowCodePageJapanese, CStrTextIsShiftJis) {
  if (!vyn::test::InChildProcess()) {
    EXPECT_TRUE(vyn::test::RunCurrentTestInChild({{"TAVLO_PLATFORM_LANGID", "0x0411"}}));
    return;
  }
  // 93 FA 96 7B: U+65E5 U+672C (日本) in code page 932 (Shift_JIS).
  CStr nihon("\x93\xFA\x96\x7B");
  EXPECT_EQ(nihon.ToVynString().PrimaryCP(), 932u);
  EXPECT_EQ(nihon.Length(), 4);
  EXPECT_EQ(WStr::FromCStr(nihon), u"\u65E5\u672C");
  EXPECT_EQ(std::string(nihon.ToUTF8()), "\xE6\x97\xA5\xE6\x9C\xAC");
  EXPECT_EQ(std::string(CStr::FromUTF16(u"\u65E5\u672C").data()), "\x93\xFA\x96\x7B");
  EXPECT_EQ(std::string(WStr(u"\u672C").ToCStr().data()), "\x96\x7B");
  EXPECT_EQ(QString(nihon), QString::fromUtf8("\xE6\x97\xA5\xE6\x9C\xAC"));
  CStr printed;
  EXPECT_EQ(printed.printf("%s!", "\x93\xFA"), 3);
  EXPECT_EQ(printed.ToVynString().PrimaryCP(), 932u);
  // Wide arguments go into the narrow code page, not the active one (1252 here).
  EXPECT_EQ(printed.printf("%S", u"\u65E5\u672C"), 4);
  EXPECT_EQ(std::string(printed.data()), "\x93\xFA\x96\x7B");
  UTF8Str utf8;
  EXPECT_EQ(utf8.printf("%s", "\x96\x7B"), 2);
  EXPECT_EQ(std::string(utf8.data()), "\xE6\x9C\xAC") << "narrow text read as code page 932";
}
