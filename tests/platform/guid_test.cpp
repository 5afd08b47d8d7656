// CLSIDFromString on the registry form of GUIDs.

#include "win32/guid.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>


namespace {

using namespace win32;

bool IsNull(const GUID& guid) {
  const GUID zero{};
  return std::memcmp(&guid, &zero, sizeof guid) == 0;
}

}  // namespace

TEST(Guid, ReadsTheRegistryForm) {
  GUID guid;
  // The fields of "{6B29FC40-CA47-1067-B31D-00DD010662DA}", the example GUID of the GUID
  // structure's documentation: Data1 to Data3 are numbers, Data4 the bytes in text order.
  ASSERT_EQ(CLSIDFromString(u"{6B29FC40-CA47-1067-B31D-00DD010662DA}", &guid), NOERROR);
  EXPECT_EQ(guid.Data1, 0x6B29FC40u);
  EXPECT_EQ(guid.Data2, 0xCA47u);
  EXPECT_EQ(guid.Data3, 0x1067u);
  const BYTE data4[8] = {0xB3, 0x1D, 0x00, 0xDD, 0x01, 0x06, 0x62, 0xDA};
  EXPECT_EQ(std::memcmp(guid.Data4, data4, 8), 0);
  GUID lower;
  ASSERT_EQ(CLSIDFromString(u"{6b29fc40-ca47-1067-b31d-00dd010662da}", &lower), NOERROR);
  EXPECT_EQ(std::memcmp(&guid, &lower, sizeof guid), 0);
  EXPECT_EQ(CLSIDFromString(nullptr, &guid), NOERROR);
  EXPECT_TRUE(IsNull(guid)) << "a null text is the null GUID";
  EXPECT_EQ(CLSIDFromString(u"{6B29FC40-CA47-1067-B31D-00DD010662DA}", nullptr), E_INVALIDARG);
}

TEST(Guid, RefusesEverythingElse) {
  const char16_t* malformed[] = {
      u"",
      u"6B29FC40-CA47-1067-B31D-00DD010662DA",     // no braces
      u"{6B29FC40-CA47-1067-B31D-00DD010662DA",    // no closing brace
      u"{6B29FC40-CA47-1067-B31D-00DD010662DA}x",  // text after it
      u"{6B29FC40-CA47-1067-B31D-00DD010662D}",    // a digit short
      u"{6B29FC40CA47-1067-B31D-00DD010662DA0}",   // a dash moved
      u"{6B29FC4G-CA47-1067-B31D-00DD010662DA}",   // not hexadecimal
      u"{6B29FC40-CA47-1067-B31D-00DD0106 2DA}",
      u"{+B29FC40-CA47-1067-B31D-00DD010662DA}",
      u"(6B29FC40-CA47-1067-B31D-00DD010662DA)",
      u"{6B29FC40-CA47-1067-B31D00-DD010662DA}",
  };
  for (const char16_t* text : malformed) {
    SCOPED_TRACE(testing::PrintToString(std::u16string(text)));
    GUID guid;
    std::memset(&guid, 0xAB, sizeof guid);
    EXPECT_EQ(CLSIDFromString(text, &guid), CO_E_CLASSSTRING);
    EXPECT_TRUE(IsNull(guid));
  }
}
