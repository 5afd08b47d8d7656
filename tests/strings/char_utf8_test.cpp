// Char::IsValidUTF8 and Char::UTF8CharLength, the encoding detector's UTF-8 checks.

#include <gtest/gtest.h>

#include <string>

#include "vynutil/char.h"

using VynSDK::Util::Char;

TEST(CharUtf8, SequenceLengthFromLeadByte) {
  const struct {
    unsigned char lead;
    unsigned int length;
  } rows[] = {
      {0x00, 1}, {0x41, 1}, {0x7F, 1}, {0x80, 1}, {0xBF, 1},  // ASCII and continuation bytes
      {0xC0, 2}, {0xC3, 2}, {0xDF, 2}, {0xE0, 3}, {0xEF, 3}, {0xF0, 4}, {0xF7, 4},
      {0xF8, 5}, {0xFB, 5}, {0xFC, 6}, {0xFD, 6}, {0xFE, 1}, {0xFF, 1},
  };
  for (const auto& row : rows) EXPECT_EQ(Char::UTF8CharLength(row.lead), row.length) << std::hex << unsigned(row.lead);
}

TEST(CharUtf8, Validity) {
  const struct {
    const char* name;
    std::string bytes;
    bool valid, multiByte;
    std::size_t missing;
  } rows[] = {
      {"empty", "", true, false, 0},
      {"plain ASCII", "Hello, world", true, false, 0},
      {"two-byte e acute", "caf\xC3\xA9", true, true, 0},
      {"euro sign", "\xE2\x82\xAC", true, true, 0},
      {"emoji", "\xF0\x9F\x98\x80", true, true, 0},
      {"three-byte sequence missing one byte", "\xE2\x82", true, false, 1},
      {"four-byte sequence missing three bytes", "ok \xF0", true, false, 3},
      {"complete sequence then a cut one", "\xC3\xA9\xE2", true, true, 2},
      {"cut six-byte form", "\xFC\x80\x80", true, false, 3},
      {"bad continuation", "\xC3\x28", false, false, 0},
      {"bad continuation of a cut sequence", "\xE2\x28", false, false, 0},
      {"stray continuation byte", "a\x80z", false, false, 0},
      {"0xFE and 0xFF", "\xFE\xFF", false, false, 0},
      {"overlong slash passes", "\xC0\xAF", true, true, 0},
      {"surrogate code point passes", "\xED\xA0\x80", true, true, 0},
      {"five-byte form passes", "\xF8\x88\x80\x80\x80", true, true, 0},
      {"six-byte form passes", "\xFC\x84\x80\x80\x80\x80", true, true, 0},
      {"beyond U+10FFFF passes", "\xF4\x90\x80\x80", true, true, 0},
      {"zero bytes are ASCII", std::string("a\0b", 3), true, false, 0},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    bool multiByte = !row.multiByte;
    std::size_t missing = 99;
    EXPECT_EQ(Char::IsValidUTF8(row.bytes.data(), row.bytes.size(), &multiByte, &missing), row.valid);
    EXPECT_EQ(multiByte, row.multiByte);
    EXPECT_EQ(missing, row.missing);
    EXPECT_EQ(Char::IsValidUTF8(row.bytes.data(), row.bytes.size()), row.valid);
  }
  EXPECT_TRUE(Char::IsValidUTF8(nullptr, 5)) << "null data counts as empty";
}

TEST(CharUtf8, ValidPrefixesOfValidText) {
  // Every prefix of valid UTF-8 is valid, missing exactly the rest of the sequence it cuts.
  const std::string text = "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80z";
  std::size_t start = 0;  // the sequence that the prefix's last byte belongs to
  for (std::size_t n = 0; n <= text.size(); ++n) {
    std::size_t end = start + Char::UTF8CharLength(static_cast<unsigned char>(text[start]));
    if (n == end) start = end;
    std::size_t missing = 99;
    ASSERT_TRUE(Char::IsValidUTF8(text.data(), n, nullptr, &missing)) << n;
    EXPECT_EQ(missing, n == start ? 0 : end - n) << n;
  }
}
