// CStr, WStr and UTF8Str language characters: counts, character runs and byte indices, checked
// against ICU's code-point iteration on random text, and malformed UTF-8 kept inside the text.

#include <gtest/gtest.h>
#include <unicode/utf8.h>

#include <random>
#include <string>
#include <utility>
#include <vector>

#include "str_test_text.h"
#include "vynutil/strclass.h"

using vyn::test::IsNullString;
using vyn::test::TextOf;

namespace {

// Random code points of every UTF-8 length: ASCII, Latin, CJK, private use, emoji.
std::vector<UChar32> RandomCodePoints(std::mt19937& random, std::size_t count) {
  static constexpr UChar32 kRanges[][2] = {
      {0x20, 0x7E}, {0x80, 0x7FF}, {0x800, 0xD7FF}, {0xE000, 0xFFFF}, {0x10000, 0x10FFFF}};
  std::vector<UChar32> code;
  for (std::size_t i = 0; i < count; ++i) {
    const auto& range = kRanges[random() % std::size(kRanges)];
    code.push_back(range[0] + static_cast<UChar32>(random() % (range[1] - range[0] + 1)));
  }
  return code;
}

std::string Utf8Of(const std::vector<UChar32>& code, std::size_t first, std::size_t count) {
  std::string out;
  for (std::size_t i = first; i < code.size() && i - first < count; ++i) {
    char bytes[4];
    int32_t n = 0;
    U8_APPEND_UNSAFE(bytes, n, code[i]);
    out.append(bytes, static_cast<std::size_t>(n));
  }
  return out;
}

}  // namespace

TEST(StrLanguageChars, RandomTextAgreesWithIcu) {
  std::mt19937 random(7);
  for (int i = 0; i < 500; ++i) {
    const std::vector<UChar32> code = RandomCodePoints(random, 1 + random() % 20);
    const std::string utf8 = Utf8Of(code, 0, code.size());
    const UTF8Str narrow(utf8.c_str());
    const WStr wide = WStr::FromUTF8(utf8.c_str());
    SCOPED_TRACE(utf8);
    ASSERT_EQ(narrow.LanguageCharacterCount(), static_cast<int>(code.size()));
    ASSERT_EQ(wide.LanguageCharacterCount(), static_cast<int>(code.size()));
    const auto first = static_cast<int>(random() % code.size());
    const auto count = 1 + static_cast<int>(random() % 5);
    const std::string expected = Utf8Of(code, static_cast<std::size_t>(first), static_cast<std::size_t>(count));
    EXPECT_EQ(TextOf(narrow.MultiByteCharacterSubString(first, count)), expected);
    EXPECT_EQ(TextOf(wide.MultiByteCharacterSubString(first, count)), expected);
    int32_t begin = 0;
    for (int k = 0; k < first; ++k) U8_FWD_1_UNSAFE(utf8.data(), begin);
    int32_t end = begin;
    U8_FWD_1_UNSAFE(utf8.data(), end);
    EXPECT_EQ(narrow.FindMultiByteCharacterFirstByteIndex(first), begin);
    EXPECT_EQ(narrow.FindMultiByteCharacterLastByteIndex(first), end - 1);
  }
}

TEST(StrLanguageChars, EdgesOfCountsRunsAndIndices) {
  EXPECT_EQ(WStr(u"\U0001F600").LanguageCharacterCount(), 1) << "one surrogate pair, two units";
  EXPECT_EQ(WStr(u"a\xD83D").LanguageCharacterCount(), 2) << "a lead surrogate before the terminator";
  EXPECT_EQ(WStr(u"\xD83D" u"ab").LanguageCharacterCount(), 2) << "a lead surrogate takes the unit after it";
  EXPECT_EQ(WStr().LanguageCharacterCount(), 0);
  const std::pair<int, int> nullRuns[] = {{3, 1}, {-1, 1}, {0, 0}};  // first beyond, negative; no count
  for (const auto& [first, count] : nullRuns) {
    EXPECT_TRUE(IsNullString(WStr(u"abc").MultiByteCharacterSubString(first, count)));
    EXPECT_TRUE(IsNullString(UTF8Str("abc").MultiByteCharacterSubString(first, count)));
    EXPECT_TRUE(IsNullString(CStr("abc").MultiByteCharacterSubString(first, count)));
  }
  const UTF8Str text("a\xE6\x97\xA5");  // a, then a three-byte ideograph
  EXPECT_EQ(text.FindMultiByteCharacterFirstByteIndex(-3), 0);
  EXPECT_EQ(text.FindMultiByteCharacterFirstByteIndex(5), 4) << "the length, beyond the last character";
  EXPECT_EQ(text.FindMultiByteCharacterLastByteIndex(5), 4);
  EXPECT_EQ(text.FindMultiByteCharacterLastByteIndex(0), 0);
  EXPECT_EQ(UTF8Str("\xE6\x97\xA5" "a").FindMultiByteCharacterLastByteIndex(0), 2);
  EXPECT_EQ(UTF8Str().FindMultiByteCharacterFirstByteIndex(0), -1);
  EXPECT_EQ(UTF8Str().FindMultiByteCharacterLastByteIndex(0), -1);
  // In a single-byte code page (1252 here) every byte is a character.
  const CStr narrow("caf\xE9!");
  EXPECT_EQ(narrow.LanguageCharacterCount(), 5);
  EXPECT_EQ(narrow.FindMultiByteCharacterLastByteIndex(3), 3);
  EXPECT_EQ(TextOf(narrow.MultiByteCharacterSubString(3, 9)), "\xC3\xA9!");
  EXPECT_EQ(CStr().FindMultiByteCharacterFirstByteIndex(1), -1);
  EXPECT_EQ(CStr("").FindMultiByteCharacterFirstByteIndex(1), 0);
}

TEST(StrLanguageChars, MalformedUtf8StaysInsideTheText) {
  // A three-byte sequence cut short by the terminator ends at its last byte present.
  const UTF8Str cut("a\xE6\x97");
  EXPECT_EQ(cut.LanguageCharacterCount(), 2);
  EXPECT_EQ(cut.FindMultiByteCharacterLastByteIndex(1), 2);
  EXPECT_EQ(TextOf(cut.MultiByteCharacterSubString(1, 1)), "\xE6\x97");
  EXPECT_EQ(UTF8Str("a\xC0\x80" "b").LanguageCharacterCount(), 3) << "overlong C0 80 decodes to 0 but is counted";
  EXPECT_EQ(UTF8Str("\xF8\x88\x80\x80\x80").LanguageCharacterCount(), 2) << "at most three continuation bytes";
  EXPECT_EQ(UTF8Str("\x80\x80").LanguageCharacterCount(), 1) << "a stray continuation byte starts a character";
}
