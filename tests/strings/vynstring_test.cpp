// VynString: null versus empty, cached forms, encodings, ordering, concatenation and failures.

#include "vynutil/vynstring.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstring>
#include <string>

#include "strings/vynstring_data.h"
#include "support/process_code_pages.h"
#include "vynutil/exception.h"
#include "win32/codepage.h"
#include "win32/oleaut.h"

using VynSDK::Util::Exception;
using VynSDK::Util::VynString;
using VynSDK::Util::VynStringInternal;

namespace {

std::u16string Utf16Of(const VynString& s) {
  const MCHAR* p = s.ToUTF16();
  return p ? std::u16string(p) : std::u16string();
}

std::string BytesOf(const char* p) { return p ? std::string(p) : std::string(); }

}  // namespace

TEST(VynString, NullDiffersFromEmpty) {
  VynString null;
  EXPECT_TRUE(null.IsNull());
  EXPECT_TRUE(null.Length(CP_UTF16) == 0 && null.ConversionCount() == 0 && null.AllocatedChars() == 0);
  std::size_t len = 99;
  EXPECT_EQ(null.ToUTF8(&len).Get(), nullptr);
  EXPECT_EQ(len, 0u);
  EXPECT_TRUE(null.ToUTF16().Get() == nullptr && null.ToUTF32().Get() == nullptr && null.ToCP(1252).Get() == nullptr);
  EXPECT_TRUE(VynString::FromUTF8(nullptr).IsNull() && VynString::FromUTF16(nullptr).IsNull());

  VynString empty = VynString::FromUTF8("");
  EXPECT_FALSE(empty.IsNull());
  EXPECT_EQ(empty.ConversionCount(), 1u);
  EXPECT_STREQ(empty.ToUTF8(), "");
  EXPECT_NE(null, empty);

  BSTR b = null.ToBSTR();
  ASSERT_NE(b, nullptr);
  EXPECT_EQ(win32::SysStringLen(b), 0u);
  win32::SysFreeString(b);
}

TEST(VynString, FormsFromEveryPrimaryEncodingAgree) {
  const std::u16string text = u"A\u00E9\u20AC\U0001F600z";  // A, e-acute, euro sign, emoji, z
  const unsigned int utf32[] = {0x41, 0xE9, 0x20AC, 0x1F600, 0x7A, 0};
  const char* utf8 = "A\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80z";
  VynString fromUtf8 = VynString::FromUTF8(utf8);
  VynString fromUtf16 = VynString::FromUTF16(text.c_str());
  VynString fromUtf32 = VynString::FromUTF32(utf32);
  for (const VynString* s : {&fromUtf8, &fromUtf16, &fromUtf32}) {
    EXPECT_EQ(Utf16Of(*s), text);
    EXPECT_STREQ(s->ToUTF8(), utf8);
    std::size_t len = 0;
    const unsigned int* u32 = s->ToUTF32(&len);
    ASSERT_EQ(len, 5u);
    EXPECT_EQ(0, std::memcmp(u32, utf32, sizeof(utf32)));
    EXPECT_EQ(s->Length(CP_UTF16), 6u);
  }
  EXPECT_EQ(fromUtf8, fromUtf16);
  EXPECT_EQ(fromUtf16, fromUtf32);
  // Windows-1252 holds all but the emoji, whose two UTF-16 units each become the default character.
  EXPECT_EQ(BytesOf(fromUtf8.ToCP(1252)), "A\xE9\x80??z");
}

TEST(VynString, CodePageTagsAreNormalisedOnEntry) {
  VynString s = VynString::FromACP("caf\xE9");  // the test main pins the active code page to 1252
  EXPECT_EQ(s.PrimaryCP(), 1252u);
  EXPECT_EQ(Utf16Of(s), u"caf\u00E9");
  EXPECT_EQ(BytesOf(s.ToACP()), "caf\xE9");
  EXPECT_EQ(s.ConversionCount(), 2u) << "ACP is the primary 1252 form";
  EXPECT_EQ(VynString::NormalizeCP(CP_ACP), 1252u);
  EXPECT_EQ(VynString::NormalizeCP(CP_UTF8), CP_UTF8);
  EXPECT_EQ(VynString::NormalizeCP(CP_NEUTRAL), CP_NEUTRAL);
  const ProcessCodePages japanese(932, 0);
  VynString nihon = VynString::FromACP("\x93\xFA\x96\x7B");  // "Japan" in Shift-JIS
  EXPECT_EQ(nihon.PrimaryCP(), 932u);
  EXPECT_EQ(Utf16Of(nihon), u"\u65E5\u672C");
}

TEST(VynString, NeutralTextServesEveryEightBitRequest) {
  VynString neutral = VynString::FromCP(CP_NEUTRAL, "plain");
  const char* primary = neutral.ToCP(CP_NEUTRAL);
  EXPECT_EQ(neutral.ToUTF8().Get(), primary);
  EXPECT_EQ(neutral.ToCP(1251).Get(), primary);
  EXPECT_EQ(neutral.ToACP().Get(), primary);
  EXPECT_EQ(neutral.ConversionCount(), 1u);
  EXPECT_EQ(Utf16Of(neutral), u"plain");
  EXPECT_EQ(neutral.ConversionCount(), 2u) << "UTF-16 is not an 8-bit request";

  // Asking other text for a neutral form answers in UTF-8, so no lossy form is cached.
  VynString wide = VynString::FromUTF16(u"\u00E9t\u00E9");
  EXPECT_STREQ(wide.ToCP(CP_NEUTRAL), "\xC3\xA9t\xC3\xA9");
  EXPECT_STREQ(wide.ToUTF8(), "\xC3\xA9t\xC3\xA9");
  EXPECT_EQ(wide.ConversionCount(), 2u);
}

TEST(VynString, CreationCopiesExactlyTheGivenUnitsAndBuffers) {
  VynString s = VynString::FromCP(1252, "ab\0cd", 5);
  EXPECT_EQ(s.Length(1252), 2u);
  EXPECT_EQ(s.AllocatedChars(), 6u);
  EXPECT_EQ(VynString::FromUTF16(u"abc").AllocatedChars(), 4u);
  EXPECT_EQ(VynString::FromUTF16(u"abcdef", 2).Length(CP_UTF16), 2u);
  const unsigned int abc32[] = {'a', 'b', 'c', 0};
  EXPECT_EQ(VynString::FromUTF32(abc32).AllocatedChars(), 4u);

  VynString buffer;
  MCHAR* w = buffer.AllocBufferUTF16(10);
  EXPECT_EQ(buffer.AllocatedChars(), 10u);
  EXPECT_EQ(w[0], 0) << "a fresh buffer reads as empty";
  std::memcpy(w, u"hello", 12);
  EXPECT_EQ(Utf16Of(buffer), u"hello");

  // A buffer of no room still reads as an empty string in every width.
  VynString none;
  unsigned int* u = none.AllocBufferUTF32(0);
  EXPECT_EQ(u[0], 0u);
  EXPECT_EQ(none.Length(CP_UTF32), 0u);
  EXPECT_EQ(none.AllocatedChars(), 0u);
  // The UTF tags have buffers of their own width; asked for by code page they are refused.
  VynString keep = VynString::FromUTF8("keep");
  for (UINT tag : {CP_UTF16, CP_UTF32}) {
    try {
      keep.AllocBufferCP(tag, 4);
      ADD_FAILURE() << "no exception for tag " << tag;
    } catch (Exception* e) {
      EXPECT_EQ(std::u16string(e->What()), u"Use AllocBufferUTF16 for UTF16 encoding or AllocBufferUTF32 for UTF32");
      delete e;
    }
  }
  EXPECT_STREQ(keep.ToUTF8(), "keep");
}

TEST(VynString, OrderingAndItsNullRules) {
  VynString null, a = VynString::FromUTF8("a"), b = VynString::FromUTF16(u"b");
  EXPECT_EQ(null.Compare(VynString()), 0);
  EXPECT_EQ(null.Compare(a), -1);
  EXPECT_EQ(a.Compare(null), 1);
  EXPECT_LT(a, b);
  EXPECT_GT(b, a);
  EXPECT_LE(a, a);
  // UTF-16 comparison is by unit value: U+FF21 (fullwidth A) sorts after U+1F600's lead surrogate.
  EXPECT_LT(VynString::FromUTF16(u"\U0001F600"), VynString::FromUTF16(u"\uFF21"));
  // Bytes compare as unsigned.
  EXPECT_LT(VynString::FromCP(1252, "a"), VynString::FromCP(1252, "\xE9"));
  // Different 8-bit code pages meet in UTF-16: e-acute is 0xE9 in 1252 and 0x82 in 850.
  EXPECT_EQ(VynString::FromCP(1252, "\xE9"), VynString::FromCP(850, "\x82"));
  EXPECT_EQ(VynString::FromCP(1252, "x").CompareIgnoreCase(VynString::FromUTF16(u"X")), 0);
  EXPECT_EQ(VynString::FromUTF16(u"\u00C4rger").CompareIgnoreCase(VynString::FromUTF8("\xC3\xA4RGER")), 0);
  EXPECT_EQ(null.CompareIgnoreCase(a), -1);
  EXPECT_LT(VynString::FromUTF8("abc").CompareIgnoreCase(VynString::FromUTF8("ABD")), 0);
  // UTF-32 strings compare unit by unit, not byte by byte.
  const unsigned int big[] = {0x100, 0}, small[] = {0xFF, 0};
  EXPECT_GT(VynString::FromUTF32(big), VynString::FromUTF32(small));
}

TEST(VynString, ConcatenationPicksTheCommonEncoding) {
  VynString left = VynString::FromCP(1252, "caf\xE9 ");
  left += VynString::FromCP(850, "\x82t\x82");
  EXPECT_EQ(left.PrimaryCP(), CP_UTF16);
  EXPECT_EQ(Utf16Of(left), u"caf\u00E9 \u00E9t\u00E9");

  VynString neutral = VynString::FromCP(CP_NEUTRAL, "n-");
  VynString joined = neutral + VynString::FromCP(1252, "\xE9");
  EXPECT_EQ(joined.PrimaryCP(), 1252u);
  EXPECT_EQ(BytesOf(joined.ToCP(1252)), "n-\xE9");
  EXPECT_EQ(neutral.Length(CP_NEUTRAL), 2u) << "operator+ leaves its operand alone";

  VynString null;
  null += VynString();
  EXPECT_TRUE(null.IsNull());
  VynString self = VynString::FromUTF8("ab");
  self += self;
  EXPECT_STREQ(self.ToUTF8(), "abab");

  const unsigned int a32[] = {0x1F600, 0}, b32[] = {0x41, 0};
  VynString utf32 = VynString::FromUTF32(a32) + VynString::FromUTF32(b32);
  EXPECT_EQ(utf32.PrimaryCP(), CP_UTF32);
  EXPECT_EQ(Utf16Of(utf32), u"\U0001F600A");
}

TEST(VynString, ErrorTexts) {
  EXPECT_EQ(Utf16Of(VynString::FromWin32Error(0xDEADBEEF)), u"Unknown Win32 Error Code 0xdeadbeef");
  EXPECT_EQ(Utf16Of(VynString::FromWin32Error(0x7FFF)), u"Unknown Win32 Error Code 0x00007fff");
  EXPECT_EQ(Utf16Of(VynString::FromWin32Error(2)), u"The system cannot find the file specified.\r\n");
  EXPECT_STREQ(VynString::FromAnsiError(ENOENT).ToUTF8(), "No such file or directory");
}

TEST(VynString, InternalReferencesCountTheBlock) {
  VynString s = VynString::FromUTF16(u"ref");
  const MCHAR* ref = VynStringInternal::ToUTF16Ref(s);
  ASSERT_NE(ref, nullptr);
  EXPECT_EQ(std::u16string(ref), u"ref");
  EXPECT_EQ(VynStringInternal::IncRef(ref), 3);
  EXPECT_EQ(VynStringInternal::DecRef(ref), 2);
  const char* utf8 = static_cast<const char*>(VynStringInternal::ToRef(s, CP_UTF8));
  EXPECT_EQ(VynStringInternal::ToStringData(utf8), VynStringInternal::ToStringData(ref))
      << "every form leads back to its block";
  VynString shared = VynStringInternal::FromRef(utf8);
  EXPECT_EQ(shared.ToUTF8().Get(), utf8);
  s.SetNull();
  shared.SetNull();
  // The two raw references keep the block alive.
  EXPECT_EQ(std::u16string(ref), u"ref");
  EXPECT_EQ(VynStringInternal::DecRef(utf8), 1);
  EXPECT_EQ(VynStringInternal::DecRef(ref), 0);
  EXPECT_EQ(VynStringInternal::IncRef(nullptr), 0);
  EXPECT_TRUE(VynStringInternal::FromRef(nullptr).IsNull());
  EXPECT_EQ(VynStringInternal::ToRef(VynString(), CP_UTF8), nullptr);
}

TEST(VynString, UnpairedSurrogatesStayTerminated) {
  // A lead surrogate just before the terminator swallows it when decoded to UTF-32; the form is
  // still terminated and its neighbours intact.
  VynString s = VynString::FromUTF16(u"ab\xD83D");
  std::size_t len = 0;
  const unsigned int* u32 = s.ToUTF32(&len);
  EXPECT_EQ(len, 3u);
  EXPECT_EQ(u32[0], u'a');
  EXPECT_EQ(u32[3], 0u);
  EXPECT_STREQ(s.ToUTF8(), "ab\xEF\xBF\xBD") << "a lone surrogate becomes U+FFFD in UTF-8";
}
