// CStr, WStr and UTF8Str editing: Substr, remove, Replace and case. Rows run over every class
// that offers the operation; Replace is checked against replacing one occurrence at a time, case
// mapping against ICU's simple case mapping (u_toupper, u_tolower) of every code point.

#include <gtest/gtest.h>
#include <unicode/uchar.h>
#include <unicode/utf16.h>

#include <climits>
#include <random>
#include <string>

#include "str_test_text.h"
#include "vynutil/strclass.h"

using vyn::test::FromText;
using vyn::test::IsNullString;
using vyn::test::TextOf;

namespace {

template <class Str>
class StrEdit : public testing::Test {};
TYPED_TEST_SUITE(StrEdit, vyn::test::UnitStrClasses, vyn::test::StrClassNames);
template <class Str>
class StrCase : public testing::Test {};
TYPED_TEST_SUITE(StrCase, vyn::test::AllStrClasses, vyn::test::StrClassNames);

// The units of a row's text for the class, or null.
template <class Str>
struct Arg {
  explicit Arg(const char* text) : holder(FromText<Str>(text)), units(text ? holder.data() : nullptr) {}
  Str holder;
  decltype(Str().data()) units;
};

std::size_t ReplaceOneAtATime(std::string& text, const std::string& find, const std::string& by, bool firstOnly,
                              std::size_t start) {
  if (text.empty() || find.empty() || start >= text.size()) return 0;
  std::size_t count = 0;
  for (std::size_t at = text.find(find, start); at != std::string::npos; at = text.find(find, at + by.size())) {
    text.replace(at, find.size(), by);
    ++count;
    if (firstOnly) break;
  }
  return count;
}

// Every code point but the surrogates, mapped by map (identity when null), as UTF-16.
std::u16string AllCodePoints(UChar32 (*map)(UChar32) = nullptr) {
  std::u16string text;
  for (UChar32 c = 1; c <= 0x10FFFF; ++c) {
    if (U_IS_SURROGATE(c)) continue;
    UChar units[2];
    int32_t n = 0;
    U16_APPEND_UNSAFE(units, n, map ? map(c) : c);
    text.append(reinterpret_cast<const char16_t*>(units), static_cast<std::size_t>(n));
  }
  return text;
}

}  // namespace

TYPED_TEST(StrEdit, SubstrAndRemove) {
  enum Op { kSubstr, kCut, kRemoveRun };
  struct Row {
    const char* name;
    Op op;
    int pos;
    int count;
    const char* expected;  // the result of Substr or the edited text; null: the null string
  };
  const Row rows[] = {
      {"substring", kSubstr, 1, 2, "bc"},
      {"substring cut at the end", kSubstr, 2, INT_MAX, "cde"},
      {"substring at the end is empty", kSubstr, 5, 1, ""},
      {"substring beyond the end is null", kSubstr, 6, 1, nullptr},
      {"substring at a negative start is null", kSubstr, -1, 1, nullptr},
      {"substring of a negative count is null", kSubstr, 0, -1, nullptr},
      {"cut", kCut, 1, 0, "a"},
      {"cut at the length changes nothing", kCut, 5, 0, "abcde"},
      {"cut at a negative position changes nothing", kCut, -1, 0, "abcde"},
      {"run", kRemoveRun, 1, 2, "ade"},
      {"run past the end is cut", kRemoveRun, 1, 100, "a"},
      {"run at the end changes nothing", kRemoveRun, 5, 1, "abcde"},
      {"run beyond the end changes nothing", kRemoveRun, 6, 0, "abcde"},
      {"negative count changes nothing", kRemoveRun, 1, -1, "abcde"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    TypeParam text = FromText<TypeParam>("abcde");
    const TypeParam copy = text;
    const TypeParam result = row.op == kSubstr ? text.Substr(row.pos, row.count)
                             : row.op == kCut  ? text.remove(row.pos)
                                               : text.remove(row.pos, row.count);
    EXPECT_EQ(IsNullString(result), row.expected == nullptr);
    EXPECT_EQ(TextOf(result), row.expected ? row.expected : "");
    EXPECT_EQ(TextOf(copy), "abcde") << "a copy sharing the block keeps its text";
  }
  TypeParam text = FromText<TypeParam>("abcdef");
  const auto* own = text.dataForWrite(20);
  text.remove(4);
  EXPECT_EQ(text.data(), own) << "a cut writes in place when the holder owns its block alone";
  text.remove(1, 2);
  EXPECT_EQ(TextOf(text), "ad");
  EXPECT_EQ(text.AllocatedChars(), 21u) << "a run is taken out into a block of the old capacity";
}

// Replace against replacing one occurrence at a time on random texts, and the inputs that text
// cannot give: nothing to find or to replace by, and a replacement from the string's own text.
TYPED_TEST(StrEdit, ReplaceAgreesWithReplacingOneAtATime) {
  std::mt19937 random(20240611);
  const auto randomText = [&](std::size_t maxLength) {
    std::string s(random() % (maxLength + 1), 'a');
    for (char& c : s) c = "ab"[random() % 2];
    return s;
  };
  for (int i = 0; i < 3000; ++i) {
    std::string expected = randomText(12);
    const std::string find = "a" + randomText(2);
    const std::string by = randomText(4);
    const bool firstOnly = random() % 4 == 0;
    const std::size_t start = random() % (expected.size() + 2);
    TypeParam text = FromText<TypeParam>(expected.c_str());
    const TypeParam copy = text;
    if (i % 2) text.dataForWrite(40);  // a private block with room to grow in place
    SCOPED_TRACE(expected + " / " + find + " -> " + by + " from " + std::to_string(start));
    const std::string original = expected;
    const std::size_t count = ReplaceOneAtATime(expected, find, by, firstOnly, start);
    EXPECT_EQ(text.Replace(Arg<TypeParam>(find.c_str()).units, Arg<TypeParam>(by.c_str()).units, firstOnly, start),
              count);
    EXPECT_EQ(TextOf(text), expected);
    EXPECT_EQ(TextOf(copy), original);
  }
  for (const auto& [find, by] : {std::pair<const char*, const char*>{"", "x"}, {nullptr, "x"}, {"b", nullptr}}) {
    TypeParam text = FromText<TypeParam>("abc");
    EXPECT_EQ(text.Replace(Arg<TypeParam>(find).units, Arg<TypeParam>(by).units), 0u);
    EXPECT_EQ(TextOf(text), "abc");
  }
  // The replacement may come from the string's own text, which the replacing rewrites.
  TypeParam grow = FromText<TypeParam>("abcabc");
  EXPECT_EQ(grow.Replace(FromText<TypeParam>("b").data(), grow.data() + 3), 2u);
  EXPECT_EQ(TextOf(grow), "aabccaabcc");
  TypeParam shrink = FromText<TypeParam>("xxabab");
  shrink.dataForWrite(10);
  EXPECT_EQ(shrink.Replace(FromText<TypeParam>("ab").data(), shrink.data() + 5), 2u);
  EXPECT_EQ(TextOf(shrink), "xxbb");
}

TYPED_TEST(StrCase, AsciiAndSharing) {
  TypeParam text = FromText<TypeParam>("Hello, World 42!");
  const TypeParam copy = text;
  text.toUpper();
  EXPECT_EQ(TextOf(text), "HELLO, WORLD 42!");
  text.toLower();
  EXPECT_EQ(TextOf(text), "hello, world 42!");
  EXPECT_EQ(TextOf(copy), "Hello, World 42!");
  TypeParam null;
  null.toUpper();
  EXPECT_TRUE(IsNullString(null)) << "an empty text is left alone";
}

TEST(StrCase, EveryCodePointMapsAsIcu) {
  const std::u16string all = AllCodePoints();
  WStr upper(all.c_str());
  upper.toUpper();
  EXPECT_TRUE(upper.data() == AllCodePoints(u_toupper));
  WStr lower(all.c_str());
  lower.toLower();
  EXPECT_TRUE(lower.data() == AllCodePoints(u_tolower));
  UTF8Str utf8 = UTF8Str::FromUTF16(all.c_str());
  utf8.toUpper();
  EXPECT_EQ(utf8.ToWStr(), upper);

  // A block made from UTF-32 counts fewer units than its UTF-16 form: mapped whole all the same.
  const unsigned int deseret[] = {0x10400, 0x10401, 0};  // DESERET CAPITAL LONG I, LONG E
  WStr fromUtf32 = WStr::FromUTF32(deseret);
  fromUtf32.toLower();
  EXPECT_EQ(fromUtf32, u"\U00010428\U00010429");
}

TEST(StrCase, LengthChangesOnlyInUtf8) {
  // LATIN SMALL LETTER DOTLESS I (C4 B1) upper-cases to I; OHM SIGN (E2 84 A6) lower-cases to
  // GREEK SMALL LETTER OMEGA (CF 89).
  UTF8Str utf8("\xC4\xB1-\xE2\x84\xA6");
  utf8.toUpper();
  EXPECT_EQ(TextOf(utf8), "I-\xE2\x84\xA6");
  utf8.toLower();
  EXPECT_EQ(TextOf(utf8), "i-\xCF\x89");
  // Code page 1252 (the test main's): C9/E9 E WITH ACUTE, FF y WITH DIAERESIS upper-cases to 9F;
  // B5 MICRO SIGN upper-cases to GREEK CAPITAL MU and DF SHARP S has no single upper case, both
  // outside 1252, so they stay.
  CStr narrow("\xE9\xFF\xB5\xDF");
  narrow.toUpper();
  EXPECT_STREQ(narrow.data(), "\xC9\x9F\xB5\xDF");
  narrow.toLower();
  EXPECT_STREQ(narrow.data(), "\xE9\xFF\xB5\xDF");
}
