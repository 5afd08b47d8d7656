// The Win32 contract of MultiByteToWideChar / WideCharToMultiByte: parameter and flag errors,
// terminators, measuring, and the code-page queries. Expected codes follow the Win32
// documentation of the two functions:
// https://learn.microsoft.com/en-us/windows/win32/api/stringapiset/nf-stringapiset-multibytetowidechar
// https://learn.microsoft.com/en-us/windows/win32/api/stringapiset/nf-stringapiset-widechartomultibyte

#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "codepage_test_support.h"

namespace {

using namespace win32;

TEST(CodePageApi, MultiByteToWideCharErrors) {
  MCHAR wide[16];
  char shared[32] = "abcdefgh";
  EXPECT_FAILS_WITH(MultiByteToWideChar(1252, 0, nullptr, 3, wide, 16), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(MultiByteToWideChar(1252, 0, "abc", -2, wide, 16), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(MultiByteToWideChar(1252, 0, "abc", 3, wide, -1), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(MultiByteToWideChar(1252, 0, "abc", 3, nullptr, 4), ERROR_INVALID_PARAMETER);
  // The same or overlapping buffers.
  EXPECT_FAILS_WITH(MultiByteToWideChar(1252, 0, shared, 4, reinterpret_cast<MCHAR*>(shared), 8),
                    ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(MultiByteToWideChar(1252, 0, shared + 6, 4, reinterpret_cast<MCHAR*>(shared), 8),
                    ERROR_INVALID_PARAMETER);
  // Unknown code pages, and the ones that are no platform code page.
  for (UINT cp : {12345u, CP_UTF16, CP_NEUTRAL, CP_UTF32}) {
    EXPECT_FAILS_WITH(MultiByteToWideChar(cp, 0, "abc", 3, wide, 16), ERROR_INVALID_PARAMETER);
  }
  EXPECT_FAILS_WITH(MultiByteToWideChar(1252, MB_PRECOMPOSED | MB_COMPOSITE, "a", 1, wide, 16),
                    ERROR_INVALID_FLAGS);
  EXPECT_FAILS_WITH(MultiByteToWideChar(1252, 0x100, "a", 1, wide, 16), ERROR_INVALID_FLAGS);
  // UTF-8 takes only MB_ERR_INVALID_CHARS.
  EXPECT_FAILS_WITH(MultiByteToWideChar(CP_UTF8, MB_PRECOMPOSED, "a", 1, wide, 16), ERROR_INVALID_FLAGS);
  EXPECT_FAILS_WITH(MultiByteToWideChar(1252, 0, "abc", 3, wide, 2), ERROR_INSUFFICIENT_BUFFER);
  // Windows takes no flags for the stateful code pages.
  EXPECT_FAILS_WITH(MultiByteToWideChar(50222, MB_ERR_INVALID_CHARS, "a", 1, wide, 8), ERROR_INVALID_FLAGS);
  EXPECT_FAILS_WITH(MultiByteToWideChar(CP_UTF7, MB_PRECOMPOSED, "a", 1, wide, 8), ERROR_INVALID_FLAGS);
  EXPECT_FAILS_WITH(MultiByteToWideChar(50222, 0, "\x1B$B\x30\x21\x30\x21", 8, wide, 1), ERROR_INSUFFICIENT_BUFFER);
}

TEST(CodePageApi, WideCharToMultiByteErrors) {
  char narrow[16];
  MCHAR shared[16] = u"abcdefgh";
  BOOL used;
  EXPECT_FAILS_WITH(WideCharToMultiByte(1252, 0, nullptr, 3, narrow, 16, nullptr, nullptr), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(WideCharToMultiByte(1252, 0, u"abc", 0, narrow, 16, nullptr, nullptr), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(WideCharToMultiByte(1252, 0, u"abc", 3, narrow, -3, nullptr, nullptr), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(WideCharToMultiByte(1252, 0, u"abc", 3, nullptr, 3, nullptr, nullptr), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(
      WideCharToMultiByte(1252, 0, shared, 4, reinterpret_cast<char*>(shared) + 2, 8, nullptr, nullptr),
      ERROR_INVALID_PARAMETER);
  // UTF-8 takes no default character, no used-default flag and no WC_NO_BEST_FIT_CHARS;
  // WC_ERR_INVALID_CHARS is for UTF-8 only.
  EXPECT_FAILS_WITH(WideCharToMultiByte(CP_UTF8, 0, u"a", 1, narrow, 16, "?", nullptr), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(WideCharToMultiByte(CP_UTF8, 0, u"a", 1, narrow, 16, nullptr, &used), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(WideCharToMultiByte(CP_UTF8, WC_NO_BEST_FIT_CHARS, u"a", 1, narrow, 16, nullptr, nullptr),
                    ERROR_INVALID_FLAGS);
  EXPECT_FAILS_WITH(WideCharToMultiByte(1252, WC_ERR_INVALID_CHARS, u"a", 1, narrow, 16, nullptr, nullptr),
                    ERROR_INVALID_FLAGS);
  EXPECT_FAILS_WITH(WideCharToMultiByte(CP_UTF16, 0, u"a", 1, narrow, 16, nullptr, nullptr), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(WideCharToMultiByte(1252, 0, u"abc", 3, narrow, 2, nullptr, nullptr), ERROR_INSUFFICIENT_BUFFER);
  // A buffer one byte short of a double-byte character.
  EXPECT_FAILS_WITH(WideCharToMultiByte(932, 0, u"a\u3042", 2, narrow, 2, nullptr, nullptr), ERROR_INSUFFICIENT_BUFFER);
  EXPECT_FAILS_WITH(MultiByteToWideChar(932, 0, "\x82\xA0\x82\xA2", 4, shared, 1), ERROR_INSUFFICIENT_BUFFER);
  // The stateful code pages take no flags, default character or used-default report.
  EXPECT_FAILS_WITH(WideCharToMultiByte(50225, 0, u"a", 1, narrow, 8, nullptr, &used), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(WideCharToMultiByte(CP_UTF7, 0, u"a", 1, narrow, 8, "?", nullptr), ERROR_INVALID_PARAMETER);
  EXPECT_FAILS_WITH(WideCharToMultiByte(50222, WC_NO_BEST_FIT_CHARS, u"a", 1, narrow, 8, nullptr, nullptr),
                    ERROR_INVALID_FLAGS);
}

TEST(CodePageApi, TerminatorsAndMeasuring) {
  for (UINT cp : {1252u, 932u, CP_UTF8, 50225u, CP_UTF7}) {
    SCOPED_TRACE(cp);
    // -1 converts the terminator too and counts it.
    const int needed = MultiByteToWideChar(cp, 0, "text", -1, nullptr, 0);
    ASSERT_EQ(needed, 5);
    MCHAR wide[8];
    std::memset(wide, 0xFF, sizeof(wide));
    ASSERT_EQ(MultiByteToWideChar(cp, 0, "text", -1, wide, 8), 5);
    EXPECT_EQ(std::u16string(wide, 5), std::u16string(u"text\0", 5));
    // An explicit length stops there, NULs included, without adding a terminator.
    ASSERT_EQ(MultiByteToWideChar(cp, 0, "te\0xt", 5, wide, 8), 5);
    EXPECT_EQ(std::u16string(wide, 5), std::u16string(u"te\0xt", 5));

    const int bytes = WideCharToMultiByte(cp, 0, u"text", -1, nullptr, 0, nullptr, nullptr);
    char narrow[16];
    ASSERT_EQ(WideCharToMultiByte(cp, 0, u"text", -1, narrow, 16, nullptr, nullptr), bytes);
    EXPECT_EQ(narrow[bytes - 1], '\0');
  }
}

TEST(CodePageApi, PseudoCodePagesResolveFirst) {
  SetProcessCodePages(932, 850);
  EXPECT_EQ(GetACP(), 932u);
  EXPECT_EQ(GetOEMCP(), 850u);
  EXPECT_TRUE(IsDBCSLeadByte(0x82));
  EXPECT_TRUE(IsDBCSLeadByteEx(CP_ACP, 0x82));
  EXPECT_FALSE(IsDBCSLeadByteEx(CP_OEMCP, 0x82));
  MCHAR wide[4];
  ASSERT_EQ(MultiByteToWideChar(CP_ACP, 0, "\x82\xA0", 2, wide, 4), 1);
  EXPECT_EQ(wide[0], 0x3042);
  ASSERT_EQ(MultiByteToWideChar(CP_OEMCP, 0, "\x82", 1, wide, 4), 1);
  EXPECT_EQ(wide[0], 0x00E9);  // cp850: LATIN SMALL LETTER E WITH ACUTE
  CPINFO info;
  ASSERT_TRUE(GetCPInfo(CP_ACP, &info));
  EXPECT_EQ(info.MaxCharSize, 2u);
  SetProcessCodePages(0, 0);
  EXPECT_EQ(GetACP(), 1252u);  // the test environment's TAVLO_PLATFORM_ACP
  EXPECT_EQ(GetOEMCP(), 437u);
  EXPECT_FALSE(IsDBCSLeadByte(0x82));
}

TEST(CodePageApi, CodePageQueries) {
  // The single-byte pages are checked with their tables (codepage_sbcs_test).
  for (UINT cp : {932u, 936u, 949u, 950u, 50222u, 50225u, CP_UTF7, CP_UTF8, CP_ACP, CP_OEMCP, CP_MACCP,
                  CP_THREAD_ACP}) {
    EXPECT_TRUE(IsValidCodePage(cp)) << cp;
  }
  for (UINT cp : {CP_UTF16, CP_NEUTRAL, CP_UTF32, 1200u, 9999u, 65002u}) {
    EXPECT_FALSE(IsValidCodePage(cp)) << cp;
    CPINFO info;
    EXPECT_FAILS_WITH(GetCPInfo(cp, &info), ERROR_INVALID_PARAMETER);
    EXPECT_FAILS_WITH(IsDBCSLeadByteEx(cp, 0x81), ERROR_INVALID_PARAMETER);
  }
  CPINFO info;
  ASSERT_TRUE(GetCPInfo(1252, &info));
  EXPECT_EQ(info.MaxCharSize, 1u);
  EXPECT_EQ(info.DefaultChar[0], '?');
  EXPECT_EQ(info.LeadByte[0], 0);
  ASSERT_TRUE(GetCPInfo(CP_UTF8, &info));
  EXPECT_EQ(info.MaxCharSize, 4u);
  ASSERT_TRUE(GetCPInfo(CP_UTF7, &info));
  EXPECT_EQ(info.MaxCharSize, 5u);
}

}  // namespace
