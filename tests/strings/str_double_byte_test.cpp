// CStr in the double-byte code pages: a lead byte and the byte after it are one character for
// every edit, search, case and character operation. Each row runs in a child process started
// with the language (and active code page) that makes the code page CStr's narrow code page.
//
// The characters used have an ASCII trail byte, so that taking bytes for characters would find
// or fold an 'A' or 'a' inside them: code page 932 83 41 / 83 61 (KATAKANA LETTER A / DI), 936
// and 949 81 41 / 81 61, 950 A4 41 / A4 61 (ideographs and Hangul syllables of the extended
// ranges of GBK, UHC and Big5).

#include <gtest/gtest.h>

#include <ostream>
#include <string>

#include "strings/narrow_codepage.h"
#include "support/child_process.h"
#include "vynutil/strclass.h"

namespace {

struct DoubleByteRow {
  const char* name;
  vyn::test::EnvironmentVariables env;
  UINT codePage;
  const char* upperTrail;  // a double-byte character with the trail byte 'A'
  const char* lowerTrail;  // the same lead byte with the trail byte 'a'
};

void PrintTo(const DoubleByteRow& row, std::ostream* os) { *os << row.name; }

const DoubleByteRow kRows[] = {
    {"Japanese932", {{"TAVLO_PLATFORM_LANGID", "0x0411"}}, 932, "\x83\x41", "\x83\x61"},
    {"ChineseSimplified936", {{"TAVLO_PLATFORM_LANGID", "0x0804"}}, 936, "\x81\x41", "\x81\x61"},
    {"Korean949", {{"TAVLO_PLATFORM_LANGID", "0x0412"}}, 949, "\x81\x41", "\x81\x61"},
    {"EnglishOnActiveCodePage932", {{"TAVLO_PLATFORM_LANGID", "0x0409"}, {"TAVLO_PLATFORM_ACP", "932"}}, 932,
     "\x83\x41", "\x83\x61"},
    {"EnglishOnActiveCodePage950", {{"TAVLO_PLATFORM_LANGID", "0x0409"}, {"TAVLO_PLATFORM_ACP", "950"}}, 950,
     "\xA4\x41", "\xA4\x61"},
};

class StrDoubleByte : public testing::TestWithParam<DoubleByteRow> {};

CStr Text(const std::string& bytes) { return CStr(bytes.c_str()); }
std::string Bytes(const CStr& s) { return s.data(); }

}  // namespace

TEST_P(StrDoubleByte, CharactersStayWhole) {
  if (!vyn::test::InChildProcess()) {
    EXPECT_TRUE(vyn::test::RunCurrentTestInChild(GetParam().env));
    return;
  }
  const std::string upper = GetParam().upperTrail;
  const std::string lower = GetParam().lowerTrail;
  const std::string lead = upper.substr(0, 1);
  ASSERT_EQ(CStr("x").ToVynString().PrimaryCP(), GetParam().codePage);
  ASSERT_EQ(WStr::FromCStr(Text(upper)).Length(), 1) << "the row's bytes are one character of the code page";

  // Characters: x at 0, the double-byte character at 1-2, y at 3.
  const CStr text = Text("x" + upper + "y");
  EXPECT_EQ(text.LanguageCharacterCount(), 3);
  EXPECT_EQ(text.FindMultiByteCharacterFirstByteIndex(2), 3);
  EXPECT_EQ(text.FindMultiByteCharacterLastByteIndex(1), 2);
  EXPECT_EQ(Bytes(text.MultiByteCharacterSubString(1, 1)), upper);
  const CStr lone = Text("ab" + lead);  // a lead byte before the terminator is a character alone
  EXPECT_EQ(lone.LanguageCharacterCount(), 3);
  EXPECT_EQ(lone.FindMultiByteCharacterLastByteIndex(2), 2) << "not the terminator after it";

  // Searches never match half of a character.
  EXPECT_EQ(text.first('A'), -1);
  EXPECT_EQ(text.first(lead[0]), -1);
  EXPECT_EQ(Text(upper + "A").last('A'), 2);
  EXPECT_FALSE(Text("x" + upper).EndsWith('A'));
  EXPECT_FALSE(Text("x" + upper).EndsWith(CStr("A")));
  EXPECT_TRUE(Text("x" + upper).EndsWith(Text(upper)));
  EXPECT_FALSE(Text(upper + "y").StartsWith(Text(lead)));
  EXPECT_FALSE(Text("x" + upper).CaseInsensitiveEqual(Text("X" + lower))) << "trail bytes are not folded";
  EXPECT_TRUE(Text("x" + upper).CaseInsensitiveEqual(Text("X" + upper)));
  EXPECT_FALSE(Text(upper + "x").StartsWith(Text(lower), false));

  // Edits leave out a character that a position falls inside, never keep half of it.
  EXPECT_EQ(Bytes(text.Substr(0, 2)), "x");
  EXPECT_EQ(Bytes(text.Substr(2, 2)), "y");
  CStr cut = text;
  EXPECT_EQ(Bytes(cut.remove(2)), "x");
  CStr run = text;
  EXPECT_EQ(Bytes(run.remove(2, 1)), "xy");
  CStr replaced = Text(upper + "A" + upper);
  EXPECT_EQ(replaced.Replace("A", "Z"), 1u) << "only the whole character A matches";
  EXPECT_EQ(Bytes(replaced), upper + "Z" + upper);
  // Made from UTF-16, the block has room for 4 units; the cut must still see all 5 bytes.
  CStr fromWide = CStr::FromUTF16(u"\uFF21\uFF21a");
  EXPECT_EQ(WStr::FromCStr(fromWide.remove(4)), u"\uFF21\uFF21");

  // Case maps characters, not bytes: FULLWIDTH LATIN CAPITAL LETTER A and GREEK CAPITAL LETTER
  // ALPHA have double-byte small letters in all four code pages.
  CStr mixed = Text("X" + upper + "Y");
  mixed.toLower();
  EXPECT_EQ(Bytes(mixed), "x" + upper + "y") << "the trail byte 'A' is not lower-cased";
  CStr wide = CStr::FromUTF16(u"\uFF21\u0391z");
  wide.toLower();
  EXPECT_EQ(WStr::FromCStr(wide), u"\uFF41\u03B1z");
  wide.toUpper();
  EXPECT_EQ(WStr::FromCStr(wide), u"\uFF21\u0391Z");
  if (VynSDK::Util::CStrLocale() != nullptr) {
    CStr room("abc");
    room.toUpper();
    EXPECT_EQ(room.AllocatedChars(), 7u) << "with a language locale, room for twice the length";
  }
}

INSTANTIATE_TEST_SUITE_P(CodePages, StrDoubleByte, testing::ValuesIn(kRows),
                         [](const testing::TestParamInfo<DoubleByteRow>& info) { return std::string(info.param.name); });
