// Single-byte code pages: every byte against ICU's converter (with the places where Windows'
// tables differ, each named with its source), round trips, default characters, best fit and the
// glyph and composition flags.

#include <gtest/gtest.h>
#include <unicode/ucnv.h>
#include <unicode/uset.h>

#include <map>
#include <memory>
#include <random>
#include <string>

#include "codepage_test_support.h"

namespace {

using namespace win32;
using codepage_test::Encode;

struct SingleBytePage {
  UINT codePage;
  const char* icuName;
  // Bytes whose Windows meaning differs from ICU's table.
  std::map<unsigned, char16_t> windows;
};

std::map<unsigned, char16_t> Range(unsigned first, unsigned last, char16_t unit) {
  std::map<unsigned, char16_t> m;
  for (unsigned b = first; b <= last; ++b) m[b] = static_cast<char16_t>(unit + (b - first));
  return m;
}

const SingleBytePage kPages[] = {
    {437, "ibm-437_P100-1995", {}},  {720, "ibm-720_P100-1997", {}},  {737, "ibm-737_P100-1997", {}},
    {775, "ibm-775_P100-1996", {}},  {850, "ibm-850_P100-1995", {}},
    // Microsoft's CP852.TXT: 0xAA NOT SIGN (IBM's table has no mapping).
    {852, "ibm-852_P100-1995", {{0xAA, 0x00AC}}},
    {855, "ibm-855_P100-1995", {}},  {857, "ibm-857_P100-1995", {}},  {858, "ibm-858_P100-1997", {}},
    {860, "ibm-860_P100-1995", {}},  {861, "ibm-861_P100-1995", {}},  {862, "ibm-862_P100-1995", {}},
    {863, "ibm-863_P100-1995", {}},  {865, "ibm-865_P100-1995", {}},  {866, "ibm-866_P100-1995", {}},
    {869, "ibm-869_P100-1995", {}},  {874, "windows-874", {}},        {1250, "windows-1250", {}},
    {1251, "windows-1251", {}},      {1252, "windows-1252", {}},
    // bestfit1253.txt (unicode.org, VENDORS/MICSFT/WindowsBestFit): undefined -> EUDC.
    {1253, "windows-1253", {{0xAA, 0xF8F9}, {0xD2, 0xF8FA}, {0xFF, 0xF8FB}}},
    {1254, "windows-1254", {}},
    // bestfit1255.txt: 0xCA HEBREW POINT QAMATS QATAN, the rest undefined -> EUDC.
    {1255, "windows-1255",
     [] {
       auto m = Range(0xD9, 0xDF, 0xF88D);
       m[0xCA] = 0x05BA;
       m[0xFB] = 0xF894;
       m[0xFC] = 0xF895;
       m[0xFF] = 0xF896;
       return m;
     }()},
    {1256, "windows-1256", {}},
    // bestfit1257.txt: undefined -> EUDC.
    {1257, "windows-1257", {{0xA1, 0xF8FC}, {0xA5, 0xF8FD}}},
    {1258, "windows-1258", {}},
    // Microsoft's MAC/ROMAN.TXT: OHM SIGN and CURRENCY SIGN (Apple's later table: Omega, euro).
    {10000, "macos-0_2-10.2", {{0xBD, 0x2126}, {0xDB, 0x00A4}}},
    {10006, "macos-6_2-10.4", {}},   {10007, "macos-7_3-10.2", {}},   {10017, "macos-7_3-10.2", {}},
    {10029, "macos-29-10.2", {}},    {10081, "macos-35-10.2", {}},
    // Windows' US-ASCII table repeats ASCII in the high half (the eighth bit is dropped).
    {20127, "US-ASCII", Range(0x80, 0xFF, 0)},
    {20866, "KOI8-R", {}},           {21866, "KOI8-U", {}},           {28591, "ISO-8859-1", {}},
    {28592, "ISO-8859-2", {}},       {28593, "ISO-8859-3", {}},       {28594, "ISO-8859-4", {}},
    {28595, "ISO-8859-5", {}},       {28596, "ISO-8859-6", {}},       {28597, "ISO-8859-7", {}},
    {28598, "ISO-8859-8", {}},       {28599, "ISO-8859-9", {}},       {28603, "ISO-8859-13", {}},
    {28605, "ISO-8859-15", {}},
};

struct IcuConverter {
  explicit IcuConverter(const char* name) {
    UErrorCode error = U_ZERO_ERROR;
    cnv = ucnv_open(name, &error);
    EXPECT_TRUE(U_SUCCESS(error)) << name;
    ucnv_setFallback(cnv, TRUE);
    ucnv_setToUCallBack(cnv, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
    ucnv_setFromUCallBack(cnv, UCNV_FROM_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &error);
  }
  ~IcuConverter() { ucnv_close(cnv); }
  // The character ICU gives the byte, or -1.
  int ToUnicode(unsigned byte) {
    const char in = static_cast<char>(byte);
    UChar out[4];
    UErrorCode error = U_ZERO_ERROR;
    ucnv_reset(cnv);
    const int32_t n = ucnv_toUChars(cnv, out, 4, &in, 1, &error);
    return U_SUCCESS(error) && n == 1 ? out[0] : -1;
  }
  // The byte ICU gives the character, or -1.
  int FromUnicode(char16_t c) {
    char out[4];
    UErrorCode error = U_ZERO_ERROR;
    ucnv_reset(cnv);
    const int32_t n = ucnv_fromUChars(cnv, out, 4, reinterpret_cast<const UChar*>(&c), 1, &error);
    return U_SUCCESS(error) && n == 1 ? static_cast<unsigned char>(out[0]) : -1;
  }
  UConverter* cnv;
};

// The one character a byte decodes to.
char16_t Decode(UINT cp, unsigned byte, DWORD flags = 0) {
  const std::u16string text = codepage_test::Decode(cp, std::string(1, static_cast<char>(byte)), flags);
  EXPECT_EQ(text.size(), 1u) << cp << " byte " << byte;
  return text.empty() ? 0xDEAD : text[0];
}

// Every byte decodes as ICU's table says (or as Windows' table where it differs) and encodes
// back to itself without a default character.
TEST(CodePageSingleByte, EveryByteAgainstIcuAndBack) {
  std::string all(256, '\0');
  for (int b = 0; b < 256; ++b) all[b] = static_cast<char>(b);
  for (const SingleBytePage& page : kPages) {
    SCOPED_TRACE(page.codePage);
    ASSERT_TRUE(IsValidCodePage(page.codePage));
    IcuConverter icu(page.icuName);
    std::u16string wide(256, u'\0');
    ASSERT_EQ(MultiByteToWideChar(page.codePage, MB_ERR_INVALID_CHARS, all.data(), 256, wide.data(), 256), 256);
    for (unsigned b = 0; b < 256; ++b) {
      SCOPED_TRACE(b);
      ASSERT_EQ(wide[b], Decode(page.codePage, b));
      if (const auto it = page.windows.find(b); it != page.windows.end()) {
        EXPECT_EQ(wide[b], it->second);
      } else if (b < 0x80) {
        EXPECT_EQ(wide[b], b);  // Windows maps ASCII to itself; ICU's IBM tables swap 0x1A, 0x1C, 0x7F.
      } else if (const int reference = icu.ToUnicode(b); reference >= 0) {
        EXPECT_EQ(wide[b], reference);
      } else {
        // Undefined in ICU's table: every byte still converts and converts back (the C1
        // control, or a private-use character as Windows does for its undefined bytes).
        EXPECT_EQ(wide[b], b < 0xA0 ? b : 0xF700 + b);
      }
    }
    BOOL used = TRUE;
    const std::string back = Encode(page.codePage, wide, WC_NO_BEST_FIT_CHARS, &used);
    EXPECT_FALSE(used);
    EXPECT_EQ(back, page.codePage == 20127 ? all.substr(0, 128) + all.substr(0, 128) : all);
  }
}

// ICU's mappings from Unicode: exact ones the same, fallbacks as best fit (refused with
// WC_NO_BEST_FIT_CHARS).
TEST(CodePageSingleByte, FromUnicodeAgainstIcu) {
  for (const SingleBytePage& page : kPages) {
    SCOPED_TRACE(page.codePage);
    IcuConverter icu(page.icuName);
    std::unique_ptr<USet, decltype(&uset_close)> roundTrip(uset_openEmpty(), uset_close);
    std::unique_ptr<USet, decltype(&uset_close)> mapped(uset_openEmpty(), uset_close);
    UErrorCode error = U_ZERO_ERROR;
    ucnv_getUnicodeSet(icu.cnv, roundTrip.get(), UCNV_ROUNDTRIP_SET, &error);
    ucnv_getUnicodeSet(icu.cnv, mapped.get(), UCNV_ROUNDTRIP_AND_FALLBACK_SET, &error);
    ASSERT_TRUE(U_SUCCESS(error));
    for (int32_t i = 0; i < uset_size(mapped.get()); ++i) {
      const UChar32 codePoint = uset_charAt(mapped.get(), i);
      if (codePoint < 0x80 || codePoint > 0xFFFF) continue;
      const auto c = static_cast<char16_t>(codePoint);
      const int reference = icu.FromUnicode(c);
      if (reference < 0 || page.windows.count(static_cast<unsigned>(reference))) continue;
      const bool exact = uset_contains(roundTrip.get(), c);
      BOOL used = TRUE;
      ASSERT_EQ(Encode(page.codePage, std::u16string(1, c), 0, &used),
                std::string(1, static_cast<char>(reference)))
          << "U+" << std::hex << int(c);
      EXPECT_FALSE(used);
      if (!exact && Decode(page.codePage, reference) != c) {
        EXPECT_EQ(Encode(page.codePage, std::u16string(1, c), WC_NO_BEST_FIT_CHARS, &used), "?")
            << "U+" << std::hex << int(c);
        EXPECT_TRUE(used);
      }
    }
  }
}

TEST(CodePageSingleByte, DefaultCharactersAndBestFit) {
  BOOL used = FALSE;
  // Unmappable characters become '?' and are reported; a surrogate pair is two of them.
  EXPECT_EQ(Encode(1252, u"a\u0100b\u4E00", WC_NO_BEST_FIT_CHARS, &used), "a?b?");
  EXPECT_TRUE(used);
  EXPECT_EQ(Encode(1252, u"\U0001F600", 0, &used), "??");
  EXPECT_TRUE(used);
  EXPECT_EQ(Encode(1252, u"plain", 0, &used), "plain");
  EXPECT_FALSE(used);
  EXPECT_EQ(Encode(1252, u"x\u4E00", 0, &used, "#"), "x#");
  EXPECT_TRUE(used);
  // Best fit: FULLWIDTH LATIN CAPITAL LETTER A -> 'A' (bestfit1252.txt WCTABLE), unless refused.
  EXPECT_EQ(Encode(1252, u"\uFF21"), "A");
  EXPECT_EQ(Encode(1252, u"\uFF21", WC_NO_BEST_FIT_CHARS), "?");
}

TEST(CodePageSingleByte, GlyphsAndComposition) {
  // MB_USEGLYPHCHARS on a DOS code page: 0x01 WHITE SMILING FACE, 0x7F HOUSE; NUL stays NUL.
  EXPECT_EQ(Decode(437, 0x01, MB_USEGLYPHCHARS), 0x263A);
  EXPECT_EQ(Decode(437, 0x7F, MB_USEGLYPHCHARS), 0x2302);
  EXPECT_EQ(Decode(437, 0x00, MB_USEGLYPHCHARS), 0x0000);
  EXPECT_EQ(Decode(437, 0x01), 0x0001);
  // MB_COMPOSITE: decomposed output (U+00E9 -> e + COMBINING ACUTE ACCENT).
  MCHAR wide[8];
  EXPECT_EQ(MultiByteToWideChar(1252, MB_COMPOSITE, "\xE9t\xE9", 3, nullptr, 0), 5);
  ASSERT_EQ(MultiByteToWideChar(1252, MB_COMPOSITE, "\xE9t\xE9", 3, wide, 8), 5);
  EXPECT_EQ(std::u16string(wide, 5), u"e\u0301te\u0301");
  SetLastError(0);
  EXPECT_EQ(MultiByteToWideChar(1252, MB_COMPOSITE, "\xE9t\xE9", 3, wide, 4), 0);
  EXPECT_EQ(GetLastError(), ERROR_INSUFFICIENT_BUFFER);
  // WC_COMPOSITECHECK: base + nonspacing mark become the precomposed character the code page has;
  // otherwise WC_SEPCHARS (default) keeps both, WC_DISCARDNS drops the mark, WC_DEFAULTCHAR
  // writes the default character.
  EXPECT_EQ(Encode(1252, u"e\u0301", WC_COMPOSITECHECK), "\xE9");
  EXPECT_EQ(Encode(1252, u"e\u0301", 0), "e?");
  EXPECT_EQ(Encode(1252, u"q\u0301", WC_COMPOSITECHECK | WC_SEPCHARS), "q?");
  EXPECT_EQ(Encode(1252, u"q\u0301", WC_COMPOSITECHECK | WC_DISCARDNS), "q");
  BOOL used = FALSE;
  EXPECT_EQ(Encode(1252, u"q\u0301z", WC_COMPOSITECHECK | WC_DEFAULTCHAR, &used), "?z");
  EXPECT_TRUE(used);
}

TEST(CodePageSingleByte, LongRandomTextAgreesWithPerByteConversion) {
  std::mt19937 rng(5);
  for (UINT cp : {1251u, 1252u, 437u, 28605u}) {
    for (int len : {1, 15, 16, 17, 63, 64, 65, 200, 1000}) {
      std::string s(len, '\0');
      for (char& c : s) c = static_cast<char>(rng() % 3 ? 'a' + rng() % 26 : rng());
      std::u16string wide(len, u'\0');
      ASSERT_EQ(MultiByteToWideChar(cp, 0, s.data(), len, wide.data(), len), len);
      for (int i = 0; i < len; ++i) {
        ASSERT_EQ(wide[i], Decode(cp, static_cast<unsigned char>(s[i]))) << cp << " " << i;
      }
      ASSERT_EQ(Encode(cp, wide, WC_NO_BEST_FIT_CHARS), s) << cp << " " << len;
    }
  }
}

}  // namespace
