// System strings: the length-prefixed layout, embedded zeros and null handling.

#include "win32/oleaut.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>

namespace {

using namespace win32;

UINT StoredByteLength(BSTR bstr) {
  UINT bytes;
  std::memcpy(&bytes, reinterpret_cast<const char*>(bstr) - sizeof(UINT), sizeof bytes);
  return bytes;
}

TEST(SystemStrings, LayoutIsByteLengthTextTerminator) {
  BSTR s = SysAllocString(u"Grüße");
  ASSERT_NE(s, nullptr);
  EXPECT_EQ(StoredByteLength(s), 10u);
  EXPECT_EQ(SysStringLen(s), 5u);
  EXPECT_EQ(SysStringByteLen(s), 10u);
  EXPECT_EQ(std::u16string(s), u"Grüße");
  EXPECT_EQ(s[5], 0);
  SysFreeString(s);

  BSTR empty = SysAllocString(u"");
  ASSERT_NE(empty, nullptr);
  EXPECT_EQ(SysStringLen(empty), 0u);
  EXPECT_EQ(empty[0], 0);
  SysFreeString(empty);
}

TEST(SystemStrings, CountedFormKeepsEmbeddedZerosAndTheStoredLength) {
  BSTR s = SysAllocStringLen(u"ab\0cd-ignored", 5);
  ASSERT_NE(s, nullptr);
  EXPECT_EQ(SysStringLen(s), 5u) << "the stored length, not the first zero";
  EXPECT_EQ(std::u16string(s, 5), std::u16string(u"ab\0cd", 5));
  EXPECT_EQ(s[5], 0);
  SysFreeString(s);

  BSTR room = SysAllocStringLen(nullptr, 8);
  ASSERT_NE(room, nullptr);
  EXPECT_EQ(SysStringLen(room), 8u);
  EXPECT_EQ(room[8], 0);
  for (int i = 0; i < 8; ++i) room[i] = u'x';  // the caller fills it
  SysFreeString(room);

  EXPECT_EQ(SysAllocStringLen(u"x", 0x80000000u), nullptr) << "byte length beyond 32 bits";
}

TEST(SystemStrings, NullIsAcceptedEverywhere) {
  EXPECT_EQ(SysAllocString(nullptr), nullptr);
  EXPECT_EQ(SysStringLen(nullptr), 0u);
  EXPECT_EQ(SysStringByteLen(nullptr), 0u);
  SysFreeString(nullptr);
}

}  // namespace
