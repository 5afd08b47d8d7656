// The runtime's string length and case-insensitive comparisons.

#include "win32/crt_string.h"

#include <gtest/gtest.h>
#include <unicode/uchar.h>

#include <cerrno>
#include <climits>
#include <vector>

namespace {

using namespace win32;

int Sign(int value) { return (value > 0) - (value < 0); }

TEST(CrtString, WideComparisonFoldsEachUnitToLowerCase) {
  struct Row {
    const char* name;
    const MCHAR* a;
    const MCHAR* b;
    int sign;
  };
  // Expected results from the simple lower-case mappings of the Unicode Character Database; the
  // pairs of case forms that fold together are all checked against ICU below.
  const std::vector<Row> rows = {
      {"ASCII", u"Hello World", u"hELLO wORLD", 0},
      {"Greek capital sigma folds to medial sigma only", u"Σ", u"σ", 0},
      {"final sigma is its own lower case", u"ς", u"σ", -1},
      {"CAPITAL I WITH DOT ABOVE lowers to i", u"İ", u"i", 0},
      {"KELVIN SIGN lowers to k", u"\u212A", u"k", 0},
      {"surrogate pairs compare unit by unit, unfolded", u"\U00010400", u"\U00010428", -1},
      {"folding to lower case puts '_' before letters", u"_", u"A", -1},
      {"prefix is smaller", u"abc", u"ABCD", -1},
      {"units compare unsigned", u"\uFFFF", u"a", 1},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(Sign(_wcsicmp(row.a, row.b)), row.sign);
    EXPECT_EQ(Sign(_wcsicmp(row.b, row.a)), -row.sign);
  }
  // The result is the difference of the folded units.
  EXPECT_EQ(_wcsicmp(u"A", u"c"), 'a' - 'c');
  EXPECT_EQ(_wcsicmp(u"ab", u"a"), 'b');
}

TEST(CrtString, WideComparisonAgreesWithIcuLowerCase) {
  // Every BMP character outside the surrogates equals its upper and title case forms when the
  // Unicode lower-case mapping brings them back together.
  for (UChar32 c = 1; c <= 0xFFFF; ++c) {
    if (c >= 0xD800 && c <= 0xDFFF) continue;
    for (UChar32 variant : {u_toupper(c), u_totitle(c)}) {
      if (variant > 0xFFFF || u_tolower(variant) != u_tolower(c)) continue;
      const MCHAR a[] = {static_cast<MCHAR>(c), 0};
      const MCHAR b[] = {static_cast<MCHAR>(variant), 0};
      ASSERT_EQ(_wcsicmp(a, b), 0) << std::hex << c;
    }
  }
}

TEST(CrtString, LengthCountedNarrowAndNullForms) {
  EXPECT_EQ(win32::wcslen(u"𝄞x"), 3u) << "a surrogate pair is two units";
  EXPECT_EQ(win32::wcslen(u"ab\0cd"), 2u);
  EXPECT_EQ(_wcsnicmp(u"ABCx", u"abcy", 3), 0);
  EXPECT_LT(_wcsnicmp(u"ABCx", u"abcy", 4), 0);
  EXPECT_EQ(_wcsnicmp(u"x", u"y", 0), 0);
  EXPECT_EQ(_wcsnicmp(u"Äb", u"äB", 100), 0) << "stops at the terminators";
  EXPECT_EQ(_strnicmp("ABCx", "abcy", 3), 0);
  EXPECT_GT(_strnicmp("ABCy", "abcx", 4), 0);
  EXPECT_EQ(_strnicmp("Ab", "aB", 100), 0);
  // Source: the _stricmp documentation: characters are folded to lower case, so '_' (0x5F)
  // sorts before 'A' (folded to 0x61); only ASCII is folded, bytes compare unsigned.
  EXPECT_LT(_stricmp("_", "A"), 0);
  EXPECT_NE(_stricmp("\xC4", "\xE4"), 0);
  EXPECT_GT(_stricmp("\xE4", "z"), 0);
  EXPECT_EQ(_stricmp("a", "C"), 'a' - 'c');
  // Null arguments give the runtime's error result.
  errno = 0;
  EXPECT_EQ(_wcsicmp(nullptr, u"a"), INT_MAX);
  EXPECT_EQ(errno, EINVAL);
  EXPECT_EQ(_wcsnicmp(u"a", nullptr, 1), INT_MAX);
  EXPECT_EQ(_stricmp("a", nullptr), INT_MAX);
  EXPECT_EQ(_strnicmp(nullptr, "a", 2), INT_MAX);
}

}  // namespace
