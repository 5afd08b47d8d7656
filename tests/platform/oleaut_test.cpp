// System strings: the length-prefixed layout, embedded zeros and null handling.

#include "win32/oleaut.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>

namespace {

using namespace win32;

TEST(SystemStrings, LayoutIsByteLengthTextTerminator) {
  BSTR s = SysAllocString(u"Grüße");
  ASSERT_NE(s, nullptr);
  UINT storedBytes;
  std::memcpy(&storedBytes, reinterpret_cast<const char*>(s) - sizeof(UINT), sizeof storedBytes);
  EXPECT_EQ(storedBytes, 10u);
  EXPECT_EQ(SysStringLen(s), 5u);
  EXPECT_EQ(SysStringByteLen(s), 10u);
  EXPECT_EQ(std::u16string(s), u"Grüße");
  SysFreeString(s);
  s = SysAllocString(u"");
  EXPECT_TRUE(s != nullptr && SysStringLen(s) == 0 && s[0] == 0) << "empty is not null";
  SysFreeString(s);

  s = SysAllocStringLen(u"ab\0cd-ignored", 5);
  ASSERT_NE(s, nullptr);
  EXPECT_EQ(SysStringLen(s), 5u) << "the stored length, not the first zero";
  EXPECT_EQ(std::u16string(s, 6), std::u16string(u"ab\0cd", 6));
  SysFreeString(s);

  s = SysAllocStringLen(nullptr, 8);
  ASSERT_NE(s, nullptr);
  EXPECT_EQ(SysStringLen(s), 8u);
  EXPECT_EQ(s[8], 0);
  for (int i = 0; i < 8; ++i) s[i] = u'x';  // the caller fills it
  SysFreeString(s);

  EXPECT_EQ(SysAllocStringLen(u"x", 0x80000000u), nullptr) << "byte length beyond 32 bits";
  EXPECT_EQ(SysAllocString(nullptr), nullptr);
  EXPECT_EQ(SysStringLen(nullptr), 0u);
  EXPECT_EQ(SysStringByteLen(nullptr), 0u);
  SysFreeString(nullptr);
}

}  // namespace
