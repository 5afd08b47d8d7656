// Char classification and case mapping: the Windows answers for named characters, ICU's Unicode
// properties on every code point, and characters beyond U+FFFF classified as themselves.

#include <gtest/gtest.h>
#include <unicode/uchar.h>

#include "vynutil/char.h"

using VynSDK::Util::Char;

namespace {

struct Classes {
  bool alpha, alnum, digit, punct, space;
};

Classes Of(unsigned int c) {
  const Char ch(c);
  return {ch.IsAlpha(), ch.IsAlphaNumeric(), ch.IsDigit(), ch.IsPunctuation(), ch.IsSpace()};
}

// The Latin-1 characters that the Windows runtime's table (ctype.cpp, "_wctype") types
// differently from the Unicode general category: superscript digits are digits, and the symbols
// of ASCII and Latin-1 are punctuation.
bool IsWindowsDigitException(UChar32 c) { return c == 0xB2 || c == 0xB3 || c == 0xB9; }
bool IsWindowsPunctuationException(UChar32 c) {
  return c == '$' || c == '+' || c == '<' || c == '=' || c == '>' || c == '^' || c == '`' ||
         c == '|' || c == '~' || (c >= 0xA2 && c <= 0xBE) || c == 0xD7 || c == 0xF7;
}

}  // namespace

TEST(CharClassify, WindowsAnswers) {
  // Expected values: the Windows runtime's Latin-1 table (ucrt ctype.cpp) and the CT_CTYPE1
  // types of GetStringTypeW for the rest.
  struct Row {
    const char* name;
    unsigned int c;
    Classes expected;  // alpha, alnum, digit, punct, space
  };
  const Row rows[] = {
      {"LATIN CAPITAL LETTER A", 0x41, {true, true, false, false, false}},
      {"DIGIT SEVEN", 0x37, {false, true, true, false, false}},
      {"LOW LINE", 0x5F, {false, false, false, true, false}},
      {"PLUS SIGN (symbol, punctuation to Windows)", 0x2B, {false, false, false, true, false}},
      {"CHARACTER TABULATION", 0x09, {false, false, false, false, true}},
      {"NEXT LINE", 0x85, {false, false, false, false, true}},
      {"NO-BREAK SPACE", 0xA0, {false, false, false, false, true}},
      {"SUPERSCRIPT TWO (digit and punctuation)", 0xB2, {false, true, true, true, false}},
      {"MICRO SIGN (letter and punctuation)", 0xB5, {true, true, false, true, false}},
      {"MULTIPLICATION SIGN", 0xD7, {false, false, false, true, false}},
      {"LATIN SMALL LETTER SHARP S", 0xDF, {true, true, false, false, false}},
      {"ARABIC-INDIC DIGIT FIVE", 0x665, {false, true, true, false, false}},
      {"DEVANAGARI VOWEL SIGN AA (a mark, not a letter)", 0x93E, {false, false, false, false, false}},
      {"ROMAN NUMERAL ONE (letter number)", 0x2160, {true, true, false, false, false}},
      {"EURO SIGN (symbol beyond Latin-1)", 0x20AC, {false, false, false, false, false}},
      {"EM DASH", 0x2014, {false, false, false, true, false}},
      {"LINE SEPARATOR", 0x2028, {false, false, false, false, true}},
      {"IDEOGRAPHIC SPACE", 0x3000, {false, false, false, false, true}},
      {"HIRAGANA LETTER A", 0x3042, {true, true, false, false, false}},
      {"CJK UNIFIED IDEOGRAPH-4E00", 0x4E00, {true, true, false, false, false}},
      {"HANGUL SYLLABLE GA", 0xAC00, {true, true, false, false, false}},
      {"FULLWIDTH DIGIT ONE", 0xFF11, {false, true, true, false, false}},
      {"lead surrogate code point", 0xD800, {false, false, false, false, false}},
      {"private use", 0xE000, {false, false, false, false, false}},
      {"null", 0, {false, false, false, false, false}},
      // Beyond the BMP, by the whole code point (not the low 16 bits).
      {"MATHEMATICAL BOLD CAPITAL A (not U+D400)", 0x1D400, {true, true, false, false, false}},
      {"MATHEMATICAL BOLD DIGIT ZERO (not U+D7CE)", 0x1D7CE, {false, true, true, false, false}},
      {"GRINNING FACE (not U+F600)", 0x1F600, {false, false, false, false, false}},
      {"CJK UNIFIED IDEOGRAPH-20000 (not NUL)", 0x20000, {true, true, false, false, false}},
      {"beyond U+10FFFF", 0x110041, {false, false, false, false, false}},
  };
  for (const Row& row : rows) {
    const Classes got = Of(row.c);
    EXPECT_EQ(got.alpha, row.expected.alpha) << row.name;
    EXPECT_EQ(got.alnum, row.expected.alnum) << row.name;
    EXPECT_EQ(got.digit, row.expected.digit) << row.name;
    EXPECT_EQ(got.punct, row.expected.punct) << row.name;
    EXPECT_EQ(got.space, row.expected.space) << row.name;
  }
}

// Against ICU's own predicates on every code point: letters (u_isalpha) and letter numbers are
// alphabetic, decimal digits (u_isdigit) are digits, punctuation (u_ispunct) is punctuation, and
// exactly the White_Space characters are space; the Latin-1 exceptions above are added.
TEST(CharClassify, EveryCodePointAgainstIcu) {
  for (UChar32 c = 0; c <= 0x10FFFF; ++c) {
    const bool alpha = u_isalpha(c) || u_charType(c) == U_LETTER_NUMBER;
    const bool digit = u_isdigit(c) || IsWindowsDigitException(c);
    const bool punct = u_ispunct(c) || IsWindowsPunctuationException(c);
    const bool space = u_isUWhiteSpace(c);
    const Classes got = Of(static_cast<unsigned int>(c));
    ASSERT_EQ(got.alpha, alpha) << std::hex << c;
    ASSERT_EQ(got.digit, digit) << std::hex << c;
    ASSERT_EQ(got.alnum, alpha || digit) << std::hex << c;
    ASSERT_EQ(got.punct, punct) << std::hex << c;
    ASSERT_EQ(got.space, space) << std::hex << c;
  }
}

TEST(CharClassify, CaseMappingAgainstIcu) {
  for (UChar32 c = 1; c <= 0x10FFFF; ++c) {
    const bool leadSurrogate = c >= 0xD800 && c <= 0xDBFF;
    const unsigned int upper = leadSurrogate ? u'?' : static_cast<unsigned int>(u_toupper(c));
    const unsigned int lower = leadSurrogate ? u'?' : static_cast<unsigned int>(u_tolower(c));
    ASSERT_EQ(Char(static_cast<unsigned int>(c)).ToUpper().CharCode(), upper) << std::hex << c;
    ASSERT_EQ(Char(static_cast<unsigned int>(c)).ToLower().CharCode(), lower) << std::hex << c;
  }
}

TEST(CharClassify, CaseMappingBeyondTheBmp) {
  // DESERET CAPITAL / SMALL LETTER LONG I; MATHEMATICAL BOLD CAPITAL A has no case mapping and
  // keeps its code point (not U+D400's).
  EXPECT_EQ(Char(0x10428u).ToUpper().CharCode(), 0x10400u);
  EXPECT_EQ(Char(0x10400u).ToLower().CharCode(), 0x10428u);
  EXPECT_EQ(Char(0x1D400u).ToLower().CharCode(), 0x1D400u);
  EXPECT_EQ(Char(0x110061u).ToUpper().CharCode(), 0x110061u) << "beyond U+10FFFF";
}
