// UTF32ToWideChar / WideCharToUTF32: measuring, converting, terminators and small buffers.

#include "vynutil/char_convert.h"

#include <gtest/gtest.h>

#include "vynutil/vynstring.h"
#include "win32/last_error.h"

using VynSDK::Util::UTF32ToWideChar;
using VynSDK::Util::WideCharToUTF32;
using VynSDK::Util::VYN_STRING_TO_TERMINATOR;

TEST(CharConvert, Utf32ToUtf16) {
  const unsigned int text[] = {0x41, 0x1F600, 0};
  EXPECT_EQ(UTF32ToWideChar(text, VYN_STRING_TO_TERMINATOR, nullptr, 0), 4u) << "A, pair, terminator";
  EXPECT_EQ(UTF32ToWideChar(text, 2, nullptr, 0), 3u);

  MCHAR out[8];
  std::fill(std::begin(out), std::end(out), MCHAR(0x7777));
  EXPECT_EQ(UTF32ToWideChar(text, VYN_STRING_TO_TERMINATOR, out, 8), 4u);
  EXPECT_EQ(std::u16string(out), u"A\U0001F600");
  EXPECT_EQ(out[4], 0) << "a terminator follows when a place is left";

  std::fill(std::begin(out), std::end(out), MCHAR(0x7777));
  EXPECT_EQ(UTF32ToWideChar(text, 2, out, 3), 3u);
  EXPECT_EQ(out[3], 0x7777) << "no place left, nothing written past the count";

  win32::SetLastError(0);
  EXPECT_EQ(UTF32ToWideChar(text, 2, out, 2), 0u) << "the pair does not fit in the last place";
  EXPECT_EQ(win32::GetLastError(), win32::ERROR_INSUFFICIENT_BUFFER);
  EXPECT_EQ(UTF32ToWideChar(nullptr, 3, out, 8), 0u);
}

TEST(CharConvert, Utf16ToUtf32) {
  const MCHAR text[] = u"x\U0001F600y";
  EXPECT_EQ(WideCharToUTF32(text, VYN_STRING_TO_TERMINATOR, nullptr, 0), 4u);
  unsigned int out[8] = {};
  EXPECT_EQ(WideCharToUTF32(text, VYN_STRING_TO_TERMINATOR, out, 8), 4u);
  EXPECT_EQ(out[0], u'x');
  EXPECT_EQ(out[1], 0x1F600u);
  EXPECT_EQ(out[2], u'y');
  EXPECT_EQ(out[3], 0u);

  // A lead surrogate followed by a non-trail unit is combined with it all the same.
  const MCHAR odd[] = {0xD800, u'A', 0};
  EXPECT_EQ(WideCharToUTF32(odd, VYN_STRING_TO_TERMINATOR, nullptr, 0), 2u);
  WideCharToUTF32(odd, VYN_STRING_TO_TERMINATOR, out, 8);
  EXPECT_EQ(out[0], (0xD800u << 10) + u'A' - 0x35FDC00u);

  // A lead surrogate as the last unit of a counted source is not combined with what lies beyond.
  const MCHAR counted[] = {u'a', 0xD83D, 0xDE00};
  EXPECT_EQ(WideCharToUTF32(counted, 2, nullptr, 0), 2u);
  EXPECT_EQ(WideCharToUTF32(counted, 2, out, 8), 2u);
  EXPECT_EQ(out[1], 0xD83Du);

  win32::SetLastError(0);
  EXPECT_EQ(WideCharToUTF32(text, VYN_STRING_TO_TERMINATOR, out, 3), 0u);
  EXPECT_EQ(win32::GetLastError(), win32::ERROR_INSUFFICIENT_BUFFER);
}

TEST(CharConvert, RoundTripOfEveryPlane) {
  std::vector<unsigned int> points;
  for (unsigned int c = 1; c < 0x110000; c += 0x3F1) {
    if (c < 0xD800 || c > 0xDFFF) points.push_back(c);
  }
  points.push_back(0);
  std::size_t units = UTF32ToWideChar(points.data(), VYN_STRING_TO_TERMINATOR, nullptr, 0);
  std::vector<MCHAR> wide(units);
  ASSERT_EQ(UTF32ToWideChar(points.data(), VYN_STRING_TO_TERMINATOR, wide.data(), units), units);
  std::vector<unsigned int> back(points.size());
  ASSERT_EQ(WideCharToUTF32(wide.data(), VYN_STRING_TO_TERMINATOR, back.data(), back.size()), points.size());
  EXPECT_EQ(back, points);
}
