// Char classification and case mapping: ICU's Unicode properties and case mappings on every code
// point, with the Windows answers where they differ, and characters beyond U+FFFF classified as
// themselves.

#include <gtest/gtest.h>
#include <unicode/uchar.h>

#include "vynutil/char.h"

using VynSDK::Util::Char;

namespace {

struct Classes {
  bool alpha, alnum, digit, punct, space;
  bool operator==(const Classes&) const = default;
};

Classes Of(unsigned int c) {
  const Char ch(c);
  return {ch.IsAlpha(), ch.IsAlphaNumeric(), ch.IsDigit(), ch.IsPunctuation(), ch.IsSpace()};
}

// The Latin-1 characters that the Windows runtime's table (ucrt ctype.cpp, "_wctype") types
// differently from the Unicode general category: superscript digits are digits, and the symbols
// of ASCII and Latin-1 are punctuation.
bool IsWindowsDigitException(UChar32 c) { return c == 0xB2 || c == 0xB3 || c == 0xB9; }
bool IsWindowsPunctuationException(UChar32 c) {
  return c == '$' || c == '+' || c == '<' || c == '=' || c == '>' || c == '^' || c == '`' ||
         c == '|' || c == '~' || (c >= 0xA2 && c <= 0xBE) || c == 0xD7 || c == 0xF7;
}

}  // namespace

TEST(CharClassify, WindowsAnswers) {
  // The Windows runtime's Latin-1 table (ucrt ctype.cpp) and the CT_CTYPE1 types of
  // GetStringTypeW, for the characters where Windows and a plain Unicode reading could part.
  const struct {
    const char* name;
    unsigned int c;
    Classes expected;  // alpha, alnum, digit, punct, space
  } rows[] = {
      {"PLUS SIGN (symbol, punctuation to Windows)", 0x2B, {false, false, false, true, false}},
      {"NEXT LINE", 0x85, {false, false, false, false, true}},
      {"NO-BREAK SPACE", 0xA0, {false, false, false, false, true}},
      {"SUPERSCRIPT TWO (digit and punctuation)", 0xB2, {false, true, true, true, false}},
      {"MICRO SIGN (letter and punctuation)", 0xB5, {true, true, false, true, false}},
      {"MULTIPLICATION SIGN", 0xD7, {false, false, false, true, false}},
      {"DEVANAGARI VOWEL SIGN AA (a mark, not a letter)", 0x93E, {false, false, false, false, false}},
      {"ROMAN NUMERAL ONE (letter number)", 0x2160, {true, true, false, false, false}},
      {"EURO SIGN (symbol beyond Latin-1)", 0x20AC, {false, false, false, false, false}},
      {"IDEOGRAPHIC SPACE", 0x3000, {false, false, false, false, true}},
      {"FULLWIDTH DIGIT ONE", 0xFF11, {false, true, true, false, false}},
      {"lead surrogate code point", 0xD800, {false, false, false, false, false}},
      // Beyond the BMP, by the whole code point (not the low 16 bits).
      {"MATHEMATICAL BOLD CAPITAL A (not U+D400)", 0x1D400, {true, true, false, false, false}},
      {"MATHEMATICAL BOLD DIGIT ZERO (not U+D7CE)", 0x1D7CE, {false, true, true, false, false}},
      {"CJK UNIFIED IDEOGRAPH-20000 (not NUL)", 0x20000, {true, true, false, false, false}},
      {"beyond U+10FFFF", 0x110041, {false, false, false, false, false}},
  };
  for (const auto& row : rows) EXPECT_TRUE(Of(row.c) == row.expected) << row.name;
}

// Against ICU's own predicates on every code point: letters (u_isalpha) and letter numbers are
// alphabetic, decimal digits (u_isdigit) are digits, punctuation (u_ispunct) is punctuation, and
// exactly the White_Space characters are space; the Latin-1 exceptions above are added. Case
// maps as u_toupper and u_tolower, except that a lead surrogate alone is no character ('?').
TEST(CharClassify, EveryCodePointAgainstIcu) {
  for (UChar32 c = 0; c <= 0x10FFFF; ++c) {
    const bool alpha = u_isalpha(c) || u_charType(c) == U_LETTER_NUMBER;
    const bool digit = u_isdigit(c) || IsWindowsDigitException(c);
    const Classes expected = {alpha, alpha || digit, digit,
                              u_ispunct(c) || IsWindowsPunctuationException(c),
                              static_cast<bool>(u_isUWhiteSpace(c))};
    const Char ch(static_cast<unsigned int>(c));
    ASSERT_TRUE(Of(static_cast<unsigned int>(c)) == expected) << std::hex << c;
    if (c == 0) continue;
    const bool leadSurrogate = c >= 0xD800 && c <= 0xDBFF;
    ASSERT_EQ(ch.ToUpper().CharCode(), leadSurrogate ? u'?' : static_cast<unsigned int>(u_toupper(c)))
        << std::hex << c;
    ASSERT_EQ(ch.ToLower().CharCode(), leadSurrogate ? u'?' : static_cast<unsigned int>(u_tolower(c)))
        << std::hex << c;
  }
  EXPECT_EQ(Char(0x110061u).ToUpper().CharCode(), 0x110061u) << "beyond U+10FFFF";
}
