// CStr, WStr and UTF8Str across encodings: makers, surrogate pairs, QString round trips, system
// strings and stream output. The process is English-language with active code page 1252.

#include <gtest/gtest.h>

#include <QString>

#include <iomanip>
#include <sstream>
#include <string>

#include "strings/narrow_codepage.h"
#include "vynutil/strclass.h"
#include "win32/oleaut.h"

using VynSDK::Util::VynString;

namespace {

std::string Bytes(const char* p) { return p ? std::string(p) : std::string("<null>"); }

}  // namespace

TEST(StrEncoding, EnglishProcessUsesTheActiveCodePage) {
  EXPECT_EQ(VynSDK::Util::CStrCodePage(), CP_ACP);
  EXPECT_EQ(VynSDK::Util::CStrLocale(), nullptr);
  EXPECT_FALSE(VynSDK::Util::CStrMultiLanguageMode());
  CStr c("caf\xE9");
  EXPECT_EQ(c.ToVynString().PrimaryCP(), 1252u);
  EXPECT_EQ(c.ToWStr(), u"caf\u00E9");  // 0xE9: LATIN SMALL LETTER E WITH ACUTE in cp1252
}

TEST(StrEncoding, MakersTakeTheClassFormOfTheNewBlock) {
  const unsigned int utf32[] = {'a', 0x1F600, 0};
  const struct {
    const char* name;
    WStr made;
    std::u16string expected;
    UINT primary;
  } rows[] = {
      {"FromCP 1251", WStr::FromCP(1251, "\xC0\xE1"), u"\u0410\u0431", 1251},  // cp1251: А б
      {"FromACP", WStr::FromACP("\x80"), u"\u20AC", 1252},                     // cp1252 0x80: €
      {"FromUTF8 with length", WStr::FromUTF8("\xC3\xA9xyz", 3), u"\u00E9x", CP_UTF8},
      {"FromUTF16 with length", WStr::FromUTF16(u"abcdef", 2), u"ab", CP_UTF16},
      {"FromMCHAR", WStr::FromMCHAR(u"m"), u"m", CP_UTF16},
      {"FromUTF32", WStr::FromUTF32(utf32), u"a\U0001F600", CP_UTF32},
      {"FromCP with a zero inside", WStr::FromCP(1252, "ab\0cd", 5), u"ab", 1252},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(std::u16string(row.made.data()), row.expected);
    EXPECT_EQ(row.made.ToVynString().PrimaryCP(), row.primary);
  }
  EXPECT_TRUE(WStr::FromUTF8(nullptr).ToVynString().IsNull() && CStr::FromUTF16(nullptr).ToVynString().IsNull() &&
              UTF8Str::FromACP(nullptr).ToVynString().IsNull());
  EXPECT_EQ(Bytes(CStr::FromUTF8("\xE2\x82\xAC").data()), "\x80");
  EXPECT_EQ(Bytes(UTF8Str::FromCP(1252, "\x80").data()), "\xE2\x82\xAC");
  EXPECT_EQ(Bytes(UTF8Str::FromCStr(CStr("\x80")).data()), "\xE2\x82\xAC");
}

TEST(StrEncoding, SurrogatePairsSurviveEveryForm) {
  // U+1F600 GRINNING FACE: UTF-16 D83D DE00, UTF-8 F0 9F 98 80.
  WStr w(u"\U0001F600x");
  EXPECT_EQ(w.Length(), 3);
  EXPECT_EQ(w.ByteCount(), 6);
  UTF8Str u = UTF8Str::FromWStr(w);
  EXPECT_EQ(Bytes(u.data()), "\xF0\x9F\x98\x80x");
  EXPECT_EQ(u.Length(), 5);
  EXPECT_EQ(u.ByteCount(), 5);
  const unsigned int* utf32 = w.ToUTF32();
  EXPECT_TRUE(utf32[0] == 0x1F600u && utf32[1] == 'x' && utf32[2] == 0u);
  EXPECT_EQ(UTF8Str::FromUTF8("\xF0\x9F\x98\x80x").ToWStr(), w);
  EXPECT_EQ(QString(w), QString::fromUtf8("\xF0\x9F\x98\x80x"));
  EXPECT_EQ(WStr(QString::fromUtf8("\xF0\x9F\x98\x80x")), w);

  // A lone surrogate becomes U+FFFD (EF BF BD) in UTF-8, as Windows converts it.
  EXPECT_EQ(Bytes(UTF8Str::FromWStr(WStr(u"\xD800" u"a")).data()), "\xEF\xBF\xBD" "a");

  std::wostringstream wide;
  wide << w << WStr(u"|\xDC00|");
  EXPECT_EQ(wide.str(), L"\U0001F600x|\uFFFD|") << "one wchar_t per code point";
}

TEST(StrEncoding, QStringRoundTrips) {
  const QString text = QString::fromUtf8("caf\xC3\xA9 \xE2\x82\xAC");
  EXPECT_EQ(QString(WStr(text)), text);
  EXPECT_EQ(QString(UTF8Str(text)), text);
  EXPECT_EQ(Bytes(UTF8Str(text).data()), "caf\xC3\xA9 \xE2\x82\xAC");
  // CStr goes through the narrow code page, 1252 here, which holds all of this text.
  EXPECT_EQ(Bytes(CStr(text).data()), "caf\xE9 \x80");
  EXPECT_EQ(QString(CStr("caf\xE9 \x80")), text);
  // Characters 1252 lacks become '?' (WideCharToMultiByte's default character).
  EXPECT_EQ(Bytes(CStr(QString::fromUtf8("\xE6\x97\xA5")).data()), "?");

  // Made from a QString the string is never null; null ones give empty QStrings.
  EXPECT_FALSE(WStr(QString()).ToVynString().IsNull() || CStr(QString()).ToVynString().IsNull() ||
               UTF8Str(QString()).ToVynString().IsNull());
  EXPECT_TRUE(QString(WStr()).isEmpty() && QString(CStr()).isEmpty() && QString(UTF8Str()).isEmpty());

  WStr assigned;
  assigned = text;
  EXPECT_EQ(assigned, text);
}

TEST(StrEncoding, RawTextAndSystemStrings) {
  const WStr null;
  std::size_t len = 99;
  ASSERT_NE(null.ToMCHAR(&len), nullptr);
  EXPECT_EQ(len, 0u);
  EXPECT_EQ(null.ToMCHAR()[0], 0);
  EXPECT_NE(null.data(), nullptr);
  EXPECT_EQ(CStr().ToMCHAR().Get(), nullptr) << "the cast of a null CStr carries no text";
  EXPECT_EQ(CStr("ab").ToMCHAR(&len)[1], u'b');
  EXPECT_EQ(len, 2u);

  for (const WStr& s : {WStr(), WStr(u"abc")}) {
    BSTR b = s.ToBSTR();
    ASSERT_NE(b, nullptr);
    EXPECT_EQ(std::u16string(b), std::u16string(s.data()));
    win32::SysFreeString(b);
  }
  BSTR fromNarrow = CStr("x\xE9").ToBSTR();
  EXPECT_EQ(std::u16string(fromNarrow), u"x\u00E9");
  win32::SysFreeString(fromNarrow);

  std::size_t utf8Len = 0;
  EXPECT_EQ(Bytes(WStr(u"\u00E9").ToUTF8(&utf8Len)), "\xC3\xA9");
  EXPECT_EQ(utf8Len, 2u);
  EXPECT_EQ(Bytes(WStr(u"\u00E9").ToCP(1250)), "\xE9");  // cp1250 0xE9: é as well
  EXPECT_EQ(Bytes(UTF8Str("\xC3\xA9").ToACP()), "\xE9");
  VynString out;
  WStr(u"v").ToVynString(out);
  EXPECT_EQ(out, VynString::FromUTF8("v"));
}

TEST(StrEncoding, StreamsWriteTextAndNothingForNull) {
  std::ostringstream narrow;
  narrow << CStr("caf\xE9") << '|' << WStr(u"\u20AC") << '|' << CStr() << WStr() << '|';
  EXPECT_EQ(narrow.str(), "caf\xE9|\x80|" "|") << "wide text in the active code page; null writes nothing";

  std::wostringstream wide;
  wide << CStr("caf\xE9 \x80") << L'|' << WStr(u"\u00E9") << CStr() << WStr();
  EXPECT_EQ(wide.str(), L"caf\u00E9 \u20AC|\u00E9");

  std::ostringstream padded;
  padded << std::setw(4) << CStr("ab");
  EXPECT_EQ(padded.str(), "  ab") << "the stream's width applies to text";
}
