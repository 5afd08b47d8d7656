// CStr, WStr and UTF8Str searching: StartsWith and EndsWith, first and last,
// CaseInsensitiveEqual and NumberOfLines; rows run over every class that offers the operation.

#include <gtest/gtest.h>

#include <string>

#include "str_test_text.h"
#include "vynutil/strclass.h"

using vyn::test::FromText;

namespace {

template <class Str>
class StrSearch : public testing::Test {};
TYPED_TEST_SUITE(StrSearch, vyn::test::AllStrClasses, vyn::test::StrClassNames);
template <class Str>
class StrSearchUnits : public testing::Test {};
TYPED_TEST_SUITE(StrSearchUnits, vyn::test::UnitStrClasses, vyn::test::StrClassNames);

}  // namespace

TYPED_TEST(StrSearch, AffixesAndLines) {
  struct Row {
    const char* name;
    const char* text;  // null: the null string
    const char* affix;
    bool caseSensitive;
    bool starts;
    bool ends;
  };
  const Row rows[] = {
      {"prefix", "abc", "ab", true, true, false},
      {"suffix", "abc", "bc", true, false, true},
      {"whole text", "abc", "abc", true, true, true},
      {"longer affix", "ab", "abc", true, false, false},
      {"empty affix starts but does not end a text", "abc", "", true, true, false},
      {"empty text and affix", "", "", true, true, true},
      {"null text and empty affix", nullptr, "", true, true, true},
      {"empty text, non-empty affix", "", "a", true, false, false},
      {"other case, exact", "ABC", "ab", true, false, false},
      {"other case, ignoring case", "ABC", "ab", false, true, false},
      {"other case at the end, ignoring case", "ABC", "bc", false, false, true},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    const TypeParam text = FromText<TypeParam>(row.text);
    EXPECT_EQ(text.StartsWith(FromText<TypeParam>(row.affix), row.caseSensitive), row.starts);
    EXPECT_EQ(text.EndsWith(FromText<TypeParam>(row.affix), row.caseSensitive), row.ends);
  }
  EXPECT_EQ(FromText<TypeParam>("a\nb\r\nc\r").NumberOfLines(), 2u) << "line feeds only";
  EXPECT_EQ(FromText<TypeParam>("one line").NumberOfLines(), 0u);
  EXPECT_EQ(TypeParam().NumberOfLines(), 0u);
}

TYPED_TEST(StrSearchUnits, UnitsAndCaseInsensitiveEquality) {
  using Unit = std::remove_cv_t<std::remove_pointer_t<decltype(TypeParam().data())>>;
  const TypeParam text = FromText<TypeParam>("abcab");
  EXPECT_EQ(text.first(Unit('a')), 0);
  EXPECT_EQ(text.last(Unit('a')), 3);
  EXPECT_EQ(text.first(Unit('x')), -1);
  EXPECT_EQ(text.first(Unit(0)), -1) << "the terminator is not part of the text";
  EXPECT_EQ(TypeParam().last(Unit('a')), -1);
  EXPECT_TRUE(text.StartsWith(Unit('A'), false));
  EXPECT_FALSE(text.StartsWith(Unit('A')));
  EXPECT_TRUE(text.EndsWith(Unit('b')));
  EXPECT_FALSE(text.EndsWith(Unit(0))) << "a non-empty text does not end with the zero unit";
  EXPECT_TRUE(TypeParam().StartsWith(Unit(0)) && TypeParam().EndsWith(Unit(0)));
  EXPECT_FALSE(TypeParam().StartsWith(Unit('a')));

  struct Row {
    const char* name;
    const char* text;
    const char* other;  // null: a null pointer and a null string
    bool equal;
  };
  const Row rows[] = {
      {"other case", "Hello", "hELLO", true},  {"different", "abc", "abd", false},
      {"longer", "abc", "ab", false},           {"empty and null", "", nullptr, true},
      {"null and empty", nullptr, "", true},    {"text and null", "a", nullptr, false},
      {"punctuation is not folded", "[", "{", false},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    const TypeParam other = FromText<TypeParam>(row.other);
    EXPECT_EQ(FromText<TypeParam>(row.text).CaseInsensitiveEqual(other), row.equal);
    EXPECT_EQ(FromText<TypeParam>(row.text).CaseInsensitiveEqual(row.other ? other.data() : nullptr), row.equal);
  }
}

TEST(StrSearch, CaseIsFoldedBeyondAscii) {
  EXPECT_TRUE(WStr(u"\u00C9COLE").CaseInsensitiveEqual(u"\u00E9cole"));
  EXPECT_TRUE(WStr(u"\u0394\u03B5\u03BB\u03C4\u03B1").StartsWith(WStr(u"\u03B4\u0395"), false)) << "Greek delta";
  // Code page 1252 (the test main's): C9 is E WITH ACUTE, E9 its small letter.
  EXPECT_TRUE(CStr("\xC9t\xC9").CaseInsensitiveEqual("\xE9T\xE9"));
  EXPECT_TRUE(CStr("caf\xC9").EndsWith('\xE9', false));
  EXPECT_FALSE(CStr("caf\xC9").EndsWith('\xE9'));
  // UTF8Str compares upper-cased texts. LATIN SMALL LETTER LONG S (C5 BF) upper-cases to S, a
  // byte shorter: the comparison runs over the upper-cased bytes.
  const UTF8Str longS("\xC5\xBF");
  EXPECT_TRUE(UTF8Str("sx").StartsWith(longS, false));
  EXPECT_TRUE(UTF8Str("xs").EndsWith(longS, false));
  EXPECT_FALSE(UTF8Str("sx").StartsWith(longS));
  EXPECT_TRUE(UTF8Str("\xC3\xA9t\xC3\xA9").EndsWith(UTF8Str("\xC3\x89"), false)) << "E WITH ACUTE";
}
