// CStr, WStr and UTF8Str: null versus empty, ordering, and the comparisons with raw text, a
// single unit, an int and QString.

#include <gtest/gtest.h>

#include <QString>

#include "vynutil/strclass.h"

namespace {

// The four orderings of a and b must agree with the sign of their expected order.
template <class Str>
void ExpectOrder(const Str& a, const Str& b, int sign) {
  EXPECT_EQ(a < b, sign < 0);
  EXPECT_EQ(a <= b, sign <= 0);
  EXPECT_EQ(a > b, sign > 0);
  EXPECT_EQ(a >= b, sign >= 0);
}

}  // namespace

TEST(StrCompare, NullAndEmptyAreEqualButNullSortsFirst) {
  const WStr null, empty(u""), text(u"a");
  EXPECT_TRUE(null == empty);
  EXPECT_FALSE(null != empty);
  ExpectOrder(null, empty, -1);  // null precedes everything, the empty string included
  ExpectOrder(empty, null, 1);
  ExpectOrder(null, WStr(), 0);
  // The integer's value is ignored: comparing with any int asks "is it empty?".
  for (const WStr* s : {&null, &empty}) {
    EXPECT_TRUE(*s == 0 && *s == 7 && 0 == *s && !(*s != 7));
    EXPECT_TRUE(s->isNull());
  }
  EXPECT_TRUE(!(text == 0) && !(text == 7) && text != 0 && 7 != text);
  EXPECT_FALSE(text.isNull());
  // Null pointers compare as empty text.
  const MCHAR* noText = nullptr;
  EXPECT_TRUE(null == noText && empty == noText && noText == empty);
  EXPECT_FALSE(text == noText);

  const CStr cnull, cempty("");
  const char* noBytes = nullptr;
  EXPECT_TRUE(cnull == cempty);
  ExpectOrder(cnull, cempty, -1);
  EXPECT_TRUE(cnull == 0 && cempty == 3 && 5 == cempty);
  EXPECT_TRUE(cnull == noBytes && noBytes == cempty);
  EXPECT_TRUE(CStr("x") != 0);
  const UTF8Str unull, uempty("");
  EXPECT_TRUE(unull == uempty);
  ExpectOrder(unull, uempty, -1);
  EXPECT_TRUE(unull.isNull() && uempty.isNull() && !UTF8Str("x").isNull());
}

TEST(StrCompare, OrderingIsByUnsignedUnits) {
  const struct {
    const char* name;
    const MCHAR *a, *b;
    int sign;      // the order of a and b as WStr
    int utf8Sign;  // the order of their UTF-8 bytes as UTF8Str
  } rows[] = {
      {"equal", u"abc", u"abc", 0, 0},
      {"prefix sorts first", u"ab", u"abc", -1, -1},
      {"first difference decides", u"abd", u"abcz", 1, 1},
      {"case is not folded", u"B", u"a", -1, -1},
      {"high units after ASCII", u"\u8000", u"a", 1, 1},
      {"BMP order", u"\u00E9", u"\uFFFD", -1, -1},
      // UTF-16 unit order is not code-point order: the lead surrogate 0xD83D < 0xFFFD, while
      // UTF-8 bytes (F0 ... > EF ...) keep code-point order.
      {"surrogate pair", u"\U0001F600", u"\uFFFD", -1, 1},
      {"empty before text", u"", u"a", -1, -1},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    ExpectOrder(WStr(row.a), WStr(row.b), row.sign);
    ExpectOrder(WStr(row.b), WStr(row.a), -row.sign);
    EXPECT_EQ(WStr(row.a) == row.b, row.sign == 0);
    EXPECT_EQ(row.b != WStr(row.a), row.sign != 0);
    ExpectOrder(UTF8Str::FromUTF16(row.a), UTF8Str::FromUTF16(row.b), row.utf8Sign);
  }
  // Bytes compare as unsigned: 0xE9 (e acute in 1252) after every ASCII letter.
  ExpectOrder(CStr("caf\xE9"), CStr("cafz"), 1);
  ExpectOrder(CStr(), CStr("a"), -1);
  ExpectOrder(CStr(), CStr(), 0);
}

TEST(StrCompare, SingleUnitComparison) {
  EXPECT_TRUE(WStr(u"a") == u'a');
  EXPECT_FALSE(WStr(u"ab") == u'a');
  EXPECT_FALSE(WStr(u"b") == u'a');
  EXPECT_TRUE(WStr(u"ab") != u'a');
  EXPECT_TRUE(WStr() == u'\0' && WStr(u"") == u'\0') << "null and empty equal only the zero unit";
  EXPECT_FALSE(WStr() == u'a');
  EXPECT_FALSE(WStr(u"a") == u'\0');
  EXPECT_TRUE(CStr("\xE9") == '\xE9' && CStr() == '\0');
  EXPECT_FALSE(CStr("\xE9\xE9") == '\xE9');
}

TEST(StrCompare, QStringComparesAsTheClassWouldHoldIt) {
  const QString cafe = QString::fromUtf8("caf\xC3\xA9");
  EXPECT_TRUE(WStr(u"caf\u00E9") == cafe);
  EXPECT_TRUE(cafe == WStr(u"caf\u00E9"));
  EXPECT_TRUE(WStr(u"cafe") != cafe);
  EXPECT_TRUE(WStr() == QString()) << "null equals empty";
  EXPECT_TRUE(UTF8Str("caf\xC3\xA9") == cafe);
  EXPECT_TRUE(cafe != UTF8Str("cafe"));
  // A CStr compares with the QString's text in the narrow code page (1252 here).
  EXPECT_TRUE(CStr("caf\xE9") == cafe);
  EXPECT_TRUE(cafe == CStr("caf\xE9"));
  EXPECT_TRUE(CStr("caf\xC3\xA9") != cafe) << "UTF-8 bytes are not 1252 text";
}
