// UTF-8 <-> UTF-16: the replacement rules for malformed input, the fast functions against ICU and
// against the Win32 calls, and the Win32 buffer rules for CP_UTF8.
//
// Reference for the replacement rule: Windows Vista and later replace each maximal invalid
// subpart with U+FFFD (MultiByteToWideChar documentation, MB_ERR_INVALID_CHARS,
// https://learn.microsoft.com/en-us/windows/win32/api/stringapiset/nf-stringapiset-multibytetowidechar),
// the practice the Unicode Standard recommends (chapter 3, "U+FFFD Substitution of Maximal
// Subparts") and the one ICU's u_strFromUTF8WithSub follows.

#include <gtest/gtest.h>
#include <unicode/ustring.h>

#include <random>
#include <string>

#include "codepage_test_support.h"

namespace {

using namespace win32;

std::u16string IcuFromUtf8(const std::string& s) {
  std::u16string out(s.size() + 1, u'\0');
  int32_t length = 0;
  UErrorCode error = U_ZERO_ERROR;
  u_strFromUTF8WithSub(out.data(), static_cast<int32_t>(out.size()), &length, s.data(),
                       static_cast<int32_t>(s.size()), 0xFFFD, nullptr, &error);
  EXPECT_TRUE(U_SUCCESS(error));
  out.resize(length);
  return out;
}

std::string IcuToUtf8(const std::u16string& s) {
  std::string out(s.size() * 3 + 1, '\0');
  int32_t length = 0;
  UErrorCode error = U_ZERO_ERROR;
  u_strToUTF8WithSub(out.data(), static_cast<int32_t>(out.size()), &length, s.data(),
                     static_cast<int32_t>(s.size()), 0xFFFD, nullptr, &error);
  EXPECT_TRUE(U_SUCCESS(error));
  out.resize(length);
  return out;
}

// The fast functions, with their measuring twins checked against the converted length.
std::u16string FastToUtf16(const std::string& s) {
  std::u16string out(s.size(), u'\0');
  out.resize(text::Utf8ToUtf16(s.data(), s.size(), out.data()));
  EXPECT_EQ(text::Utf8ToUtf16Length(s.data(), s.size()), out.size());
  return out;
}

std::string FastToUtf8(const std::u16string& s) {
  std::string out(s.size() * 3, '\0');
  out.resize(text::Utf16ToUtf8(s.data(), s.size(), out.data()));
  EXPECT_EQ(text::Utf16ToUtf8Length(s.data(), s.size()), out.size());
  return out;
}

std::u16string Win32ToUtf16(const std::string& s) { return codepage_test::Decode(CP_UTF8, s); }
std::string Win32ToUtf8(const std::u16string& s) { return codepage_test::Encode(CP_UTF8, s); }

// A strict conversion (MB_ERR_INVALID_CHARS / WC_ERR_INVALID_CHARS) measures valid text and
// fails invalid text with ERROR_NO_UNICODE_TRANSLATION.
void ExpectStrict(int strict, bool valid, std::size_t length) {
  EXPECT_EQ(strict, valid ? static_cast<int>(length) : 0);
  if (!valid) {
    EXPECT_EQ(GetLastError(), ERROR_NO_UNICODE_TRANSLATION);
  }
}

TEST(CodePageUtf8, ReplacementRules) {
  struct Row {
    const char* name;
    std::string bytes;
    std::u16string expected;
  };
  const Row rows[] = {
      {"ascii", "abc", u"abc"},
      {"two byte", "\xC3\xA9", u"\u00E9"},
      {"three byte", "\xE2\x82\xAC", u"\u20AC"},
      {"four byte", "\xF0\x9F\x98\x80", u"\U0001F600"},
      {"largest scalar value", "\xF4\x8F\xBF\xBF", u"\U0010FFFF"},
      // Raymond Chen, "How does the MultiByteToWideChar function treat invalid characters?"
      // (devblogs.microsoft.com/oldnewthing/20120504-00/?p=7703): C0 41 42 gives FFFD 41 42.
      {"lone C0 before ASCII", "\xC0\x41\x42", u"\uFFFD\u0041\u0042"},
      {"truncated two byte at end", "a\xC3", u"a\uFFFD"},
      {"truncated three byte at end", "a\xE2\x82", u"a\uFFFD"},
      {"truncated four byte at end", "a\xF0\x9F\x98", u"a\uFFFD"},
      {"truncated three byte before ASCII", "\xE2\x82z", u"\uFFFDz"},
      {"truncated four byte before lead", "\xF0\x9F\xC3\xA9", u"\uFFFD\u00E9"},
      {"overlong two byte", "\xC0\x80", u"\uFFFD\uFFFD"},
      {"overlong C1", "\xC1\xBF", u"\uFFFD\uFFFD"},
      {"overlong three byte", "\xE0\x80\x80", u"\uFFFD\uFFFD\uFFFD"},
      {"overlong four byte", "\xF0\x80\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},
      {"surrogate D800 encoded", "\xED\xA0\x80", u"\uFFFD\uFFFD\uFFFD"},
      {"surrogate pair encoded (CESU-8)", "\xED\xA0\xBD\xED\xB8\x80", std::u16string(6, u'\uFFFD')},
      {"above U+10FFFF", "\xF4\x90\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},
      {"F5 lead", "\xF5\x80\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},
      {"five byte form", "\xF8\x88\x80\x80\x80", std::u16string(5, u'\uFFFD')},
      {"stray continuation", "a\x80z", u"a\uFFFDz"},
      {"stray continuations", "\x80\xBF\x80", u"\uFFFD\uFFFD\uFFFD"},
      {"FE and FF", "\xFE\xFF", u"\uFFFD\uFFFD"},
      {"three byte with bad second", "\xE2\x28\xA1", u"\uFFFD(\uFFFD"},
      {"three byte with bad third", "\xE2\x82\x28", u"\uFFFD("},
      {"embedded NUL", std::string("a\0b", 3), std::u16string(u"a\0b", 3)},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(FastToUtf16(row.bytes), row.expected);
    EXPECT_EQ(Win32ToUtf16(row.bytes), row.expected);
    EXPECT_EQ(IcuFromUtf8(row.bytes), row.expected);  // the reference agrees with the table
    // Long enough for the vector paths, at an odd offset.
    EXPECT_EQ(FastToUtf16(std::string(37, 'x') + row.bytes + std::string(21, 'y')),
              std::u16string(37, u'x') + row.expected + std::u16string(21, u'y'));
    SetLastError(0);
    ExpectStrict(MultiByteToWideChar(CP_UTF8, MB_ERR_INVALID_CHARS, row.bytes.data(),
                                     static_cast<int>(row.bytes.size()), nullptr, 0),
                 row.expected.find(u'\uFFFD') == std::u16string::npos, row.expected.size());
  }
}

TEST(CodePageUtf8, LoneSurrogatesBecomeReplacementCharacters) {
  struct Row {
    const char* name;
    std::u16string units;
    std::string expected;
  };
  const Row rows[] = {
      {"pair", u"\U0001F600", "\xF0\x9F\x98\x80"},
      {"lone lead at end", u"a\xD83D", "a\xEF\xBF\xBD"},
      {"lone lead before ASCII", u"\xD83Dz", "\xEF\xBF\xBDz"},
      {"lone trail", u"\xDE00z", "\xEF\xBF\xBDz"},
      {"reversed pair", u"\xDE00\xD83D", "\xEF\xBF\xBD\xEF\xBF\xBD"},
      {"two leads then trail", u"\xD83D\xD83D\xDE00", "\xEF\xBF\xBD\xF0\x9F\x98\x80"},
      {"U+FFFF", u"\uFFFF", "\xEF\xBF\xBF"},
      {"U+07FF and U+0800", u"\u07FF\u0800", "\xDF\xBF\xE0\xA0\x80"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(FastToUtf8(row.units), row.expected);
    EXPECT_EQ(Win32ToUtf8(row.units), row.expected);
    EXPECT_EQ(IcuToUtf8(row.units), row.expected);
    EXPECT_EQ(FastToUtf8(std::u16string(19, u'x') + row.units + std::u16string(40, u'y')),
              std::string(19, 'x') + row.expected + std::string(40, 'y'));
    SetLastError(0);
    ExpectStrict(WideCharToMultiByte(CP_UTF8, WC_ERR_INVALID_CHARS, row.units.data(),
                                     static_cast<int>(row.units.size()), nullptr, 0, nullptr, nullptr),
                 row.expected.find("\xEF\xBF\xBD") == std::string::npos, row.expected.size());
  }
}

// Text made of pieces chosen to hit every path: ASCII runs of every length around the vector
// widths, 2-, 3- and 4-byte characters, and broken sequences.
std::string RandomUtf8(std::mt19937& rng, bool corrupt) {
  static const char* const kPieces[] = {"a", "0123456789abcdef", "0123456789abcdefghijklmnopqrstuv",
                                        "\xC3\xA9", "\xD0\x96", "\xE2\x82\xAC", "\xE6\x97\xA5\xE6\x9C\xAC",
                                        "\xF0\x9F\x98\x80", "\xEF\xBF\xBD", " ", "\n"};
  static const char* const kBroken[] = {"\x80", "\xC3", "\xE2\x82", "\xF0\x9F\x98", "\xC0\xAF",
                                        "\xED\xA0\x80", "\xF4\x90\x80\x80", "\xFF", "\xE0\x9F\xBF"};
  std::string s;
  const int pieces = std::uniform_int_distribution<int>(0, 40)(rng);
  for (int i = 0; i < pieces; ++i) {
    s += corrupt && rng() % 5 == 0 ? kBroken[rng() % std::size(kBroken)] : kPieces[rng() % std::size(kPieces)];
  }
  return s;
}

TEST(CodePageUtf8, AgreesWithIcuAndWin32OnRandomText) {
  std::mt19937 rng(20240601);
  static const char16_t kUnits[] = {u'a',   u'Z',   0x7F,   0x80,   0x7FF,  0x800,  0x20AC, 0xD7FF,
                                    0xD800, 0xDBFF, 0xDC00, 0xDFFF, 0xE000, 0xFFFD, 0xFFFF};
  for (int round = 0; round < 3000; ++round) {
    SCOPED_TRACE(round);
    std::string s;
    if (round % 3 == 2) {
      s.resize(rng() % 200);
      for (char& c : s) c = static_cast<char>(rng());
    } else {
      s = RandomUtf8(rng, round % 3 == 1);
    }
    const std::u16string expected = IcuFromUtf8(s);
    ASSERT_EQ(FastToUtf16(s), expected);
    if (!s.empty()) {
      ASSERT_EQ(Win32ToUtf16(s), expected);
    }
    ASSERT_EQ(FastToUtf16(FastToUtf8(expected)), expected);  // the (now valid) text round-trips

    // UTF-16 with lone surrogates.
    std::u16string units(rng() % 150, u'\0');
    for (char16_t& c : units) c = rng() % 3 ? kUnits[rng() % std::size(kUnits)] : char16_t(rng());
    const std::string bytes = IcuToUtf8(units);
    ASSERT_EQ(FastToUtf8(units), bytes);
    if (!units.empty()) {
      ASSERT_EQ(Win32ToUtf8(units), bytes);
    }
  }
}

// Every buffer size from 1 past the needed size: the needed size or more succeeds, anything
// smaller fails with ERROR_INSUFFICIENT_BUFFER, and nothing is written past the buffer.
template <typename Out, typename Convert>
void CheckBufferSizes(const Out& expected, Convert convert) {
  const int needed = static_cast<int>(expected.size());
  for (int size = 1; size <= needed + 2; ++size) {
    SCOPED_TRACE(size);
    Out out(size + 8, '#');
    SetLastError(0);
    const int got = convert(out.data(), size);
    if (size < needed) {
      EXPECT_EQ(got, 0);
      EXPECT_EQ(GetLastError(), ERROR_INSUFFICIENT_BUFFER);
    } else {
      ASSERT_EQ(got, needed);
      EXPECT_EQ(out.substr(0, needed), expected);
    }
    EXPECT_EQ(out.substr(size), Out(8, '#'));
  }
}

TEST(CodePageUtf8, BufferSizesAroundTheNeededSize) {
  const std::string bytes = "ab\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80" + std::string(40, 'q') + "\xE6\x97\xA5\xC3";
  const std::u16string units = FastToUtf16(bytes);
  CheckBufferSizes(units, [&](MCHAR* out, int size) {
    return MultiByteToWideChar(CP_UTF8, 0, bytes.data(), bytes.size(), out, size);
  });
  CheckBufferSizes(FastToUtf8(units), [&](char* out, int size) {
    return WideCharToMultiByte(CP_UTF8, 0, units.data(), units.size(), out, size, nullptr, nullptr);
  });
}

TEST(CodePageUtf8, LongTextsCrossEveryBlockBoundary) {
  // ASCII of every length up to 300 followed by one non-ASCII character and more ASCII.
  for (int len = 0; len < 300; ++len) {
    const std::string s = std::string(len, 'k') + "\xE2\x82\xAC" + std::string(len % 37, 'z');
    const std::u16string expected = std::u16string(len, u'k') + u"\u20AC" + std::u16string(len % 37, u'z');
    ASSERT_EQ(FastToUtf16(s), expected) << len;
    ASSERT_EQ(FastToUtf8(expected), s) << len;
  }
}

}  // namespace
