// CStr, WStr and UTF8Str: sharing of blocks, copy-on-write through dataForWrite, capacity, Resize,
// conversions cached once per block, and concatenation.

#include <gtest/gtest.h>

#include <string>

#include "vynutil/exception.h"
#include "vynutil/strclass.h"

using VynSDK::Util::NullDereferenceException;
using VynSDK::Util::VynString;
using VynSDK::Util::VynStringInternal;

namespace {

const void* BlockOf(const void* chars) { return VynStringInternal::ToStringData(chars); }

template <class Str>
std::size_t FormsOf(const Str& s) {
  return s.ToVynString().ConversionCount();
}

}  // namespace

TEST(StrSharing, CopiesAndConversionsShareOneBlock) {
  WStr w(u"shared text");
  EXPECT_EQ(WStr(w).data(), w.data()) << "a copy is the same characters, not a copy of them";
  CStr first = w.ToCStr();
  EXPECT_EQ(BlockOf(first.data()), BlockOf(w.data()));
  EXPECT_EQ(w.ToCStr().data(), first.data()) << "the narrow form is made once and cached";
  UTF8Str utf8 = UTF8Str::FromWStr(w);
  EXPECT_EQ(BlockOf(utf8.data()), BlockOf(w.data()));
  EXPECT_EQ(WStr::FromCStr(first).data(), w.data()) << "back to the UTF-16 form that exists";
  EXPECT_EQ(utf8.ToWStr().data(), w.data());
  EXPECT_EQ(FormsOf(w), 3u) << "UTF-16 primary, narrow and UTF-8 forms";
  // A copy made through a cast shares the block too, except UTF8Str, which keeps a UTF-8 block.
  VynString s = VynString::FromUTF16(u"caf\u00E9");
  EXPECT_EQ(BlockOf(WStr(s.ToUTF16()).data()), BlockOf(s.ToUTF16().Get()));
  CStr c(s.ToACP());
  EXPECT_EQ(BlockOf(c.data()), BlockOf(s.ToUTF16().Get()));
  EXPECT_EQ(c, "caf\xE9");
  UTF8Str u(s.ToUTF8());
  EXPECT_NE(BlockOf(u.data()), BlockOf(s.ToUTF16().Get()));
  EXPECT_EQ(FormsOf(u), 1u);
  EXPECT_EQ(std::string(u.data()), "caf\xC3\xA9");
  EXPECT_FALSE(UTF8Str(VynString().ToUTF8()).ToVynString().IsNull()) << "an empty text, not the null string";
}

TEST(StrSharing, DataForWriteCopiesSharedBlocksAndGrowsOnlyWhenAsked) {
  CStr narrow("hello");
  WStr wide = WStr::FromCStr(narrow);
  EXPECT_EQ(BlockOf(wide.data()), BlockOf(narrow.data()));
  MCHAR* out = wide.dataForWrite(5);
  EXPECT_NE(BlockOf(out), BlockOf(narrow.data()));
  out[0] = u'j';
  EXPECT_EQ(wide, u"jello");
  EXPECT_EQ(narrow, "hello") << "the other holder never sees the write";
  // Only holder, but the block carries a cached form that the write would make stale.
  WStr alone(u"abc");
  alone.ToUTF8();
  const MCHAR* cached = alone.data();
  EXPECT_NE(alone.dataForWrite(1), cached);

  // The sole owner writes in place, with room for capacity - 1 units; more needs a new block.
  WStr w(u"abcdef");
  EXPECT_EQ(w.AllocatedChars(), 7u) << "six units and the terminator";
  const MCHAR* before = w.data();
  EXPECT_EQ(w.dataForWrite(3), before);
  EXPECT_EQ(w, u"abcdef") << "in place the text is handed back as it is";
  EXPECT_EQ(w.dataForWrite(static_cast<std::size_t>(-1)), before);
  EXPECT_NE(w.dataForWrite(7), before);
  EXPECT_EQ(w.AllocatedChars(), 8u);
  EXPECT_EQ(w, u"abcdef");

  // A shared block is copied cut to the wanted length, in a block of the old capacity.
  WStr big;
  big.dataForWrite(99);
  EXPECT_EQ(big.AllocatedChars(), 100u);
  std::u16string text(60, u'x');
  std::char_traits<char16_t>::copy(big.dataForWrite(99), text.c_str(), text.size() + 1);
  WStr shared = big;
  EXPECT_NE(shared.dataForWrite(5), big.data());
  EXPECT_EQ(shared.AllocatedChars(), 100u) << "the capacity is kept";
  EXPECT_EQ(shared, u"xxxxx") << "cut to the wanted length";
  EXPECT_EQ(big.Length(), 60);
  WStr null;
  null.dataForWrite(static_cast<std::size_t>(-1));
  EXPECT_EQ(null.AllocatedChars(), 257u) << "256 units of room and the terminator";
  EXPECT_EQ(null, u"");
  EXPECT_FALSE(null.ToVynString().IsNull());
  UTF8Str u8("0123456789");
  UTF8Str other = u8;
  EXPECT_EQ(std::string(u8.dataForWrite(20)), "0123456789");
  EXPECT_EQ(u8.AllocatedChars(), 21u);
  EXPECT_EQ(u8.ToVynString().PrimaryCP(), CP_UTF8);
}

TEST(StrSharing, ResizeCutsPadsAndEmpties) {
  const struct {
    const char* name;
    const char* text;  // nullptr: the null string
    int n;
    const char* expected;
    bool expectNull;
  } rows[] = {
      {"cut", "abcdef", 3, "abc", false},   {"pad", "ab", 5, "ab   ", false},
      {"same", "abc", 3, "abc", false},     {"zero", "abc", 0, "", true},
      {"negative", "abc", -4, "", true},    {"from null", nullptr, 2, "  ", false},
      {"from empty", "", 3, "   ", false},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    CStr c(row.text);
    CStr keep = c;
    c.Resize(row.n);
    EXPECT_EQ(c, row.expected);
    EXPECT_EQ(c.ToVynString().IsNull(), row.expectNull);
    EXPECT_EQ(keep, row.text ? row.text : "") << "a shared block is not resized under others";
    WStr w = WStr::FromACP(row.text);
    w.Resize(row.n);
    EXPECT_EQ(w, WStr::FromACP(row.expected));
    EXPECT_EQ(w.ToVynString().IsNull(), row.expectNull);
    UTF8Str u(row.text);
    u.Resize(row.n);
    EXPECT_EQ(u, UTF8Str(row.expected));
  }
  CStr empty("");
  empty.Resize(4);
  EXPECT_EQ(empty.AllocatedChars(), 5u) << "an empty CStr is replaced by a block of n + 1 bytes";
}

TEST(StrSharing, IndexingReadsAndWritesOnlyPrivateText) {
  WStr a(u"abc");
  WStr b = a;
  const WStr& constB = b;
  EXPECT_EQ(constB[1], u'b');
  EXPECT_EQ(&constB[0], a.data()) << "reading does not copy";
  b[0] = u'x';
  EXPECT_EQ(b, u"xbc");
  EXPECT_EQ(a, u"abc");
  CStr c("abc");
  CStr d = c;
  d[2] = 'z';
  EXPECT_EQ(d, "abz");
  EXPECT_EQ(c, "abc");

  // Thrown by value, with the class named in the message.
  const MCHAR* const wideMessage = u"Attempting to dereference null WStr::buf variable in WStr::operator[]";
  const struct {
    const char* name;
    void (*index)();
    const MCHAR* message;
  } nulls[] = {
      {"WStr", [] { (void)WStr()[0]; }, wideMessage},
      {"const WStr", [] { const WStr w; (void)w[0]; }, wideMessage},
      {"CStr", [] { (void)CStr()[0]; }, u"Attempting to dereference null CStr::buf variable in CStr::operator[]"},
  };
  for (const auto& row : nulls) {
    SCOPED_TRACE(row.name);
    try {
      row.index();
      ADD_FAILURE() << "no exception";
    } catch (const NullDereferenceException& e) {
      EXPECT_EQ(std::u16string(e.What()), std::u16string(row.message));
    }
  }
}

TEST(StrSharing, AssignmentKeepsTheSourceAliveWhileTakingIt) {
  // The new text is taken before the old block is released, so text read from the string's own
  // block stays valid (AddressSanitizer reports the read otherwise).
  WStr w(u"private text");
  w = w.data() + 8;
  EXPECT_EQ(w, u"text");
  CStr c("narrow text");
  c = c.data() + 7;
  EXPECT_EQ(c, "text");
  UTF8Str u("utf8 text");
  u = u.data() + 5;
  EXPECT_EQ(u, UTF8Str("text"));

  WStr self(u"self");
  const MCHAR* before = self.data();
  self = self;
  self = std::move(self);
  EXPECT_EQ(self.data(), before);
  WStr moved = std::move(self);
  EXPECT_EQ(moved.data(), before);
  EXPECT_TRUE(self.ToVynString().IsNull());
}

TEST(StrSharing, ConcatenationMakesANewBlockInTheCommonEncoding) {
  WStr null;
  WStr text(u"text");
  null += text;
  EXPECT_EQ(null.data(), text.data()) << "a null string takes the other's block";
  WStr unchanged = text;
  unchanged += WStr();
  EXPECT_EQ(unchanged.data(), text.data());
  EXPECT_TRUE((WStr() + WStr()).ToVynString().IsNull());

  WStr joined = text + WStr(u"\u00E9");
  EXPECT_EQ(joined, u"text\u00E9");
  EXPECT_EQ(text, u"text");
  joined.Append(joined).append(WStr(u"!"));
  EXPECT_EQ(joined, u"text\u00E9text\u00E9!");

  // A UTF-8 text joined to a narrow one meets in UTF-16; the CStr then takes the narrow form.
  CStr narrow("caf\xE9 ");
  narrow += CStr(VynString::FromUTF8("cr\xC3\xA8me"));
  EXPECT_EQ(narrow, "caf\xE9 cr\xE8me");
  EXPECT_EQ(narrow.ToVynString().PrimaryCP(), CP_UTF16);
  UTF8Str a("a\xC3\xA9"), b("b");
  EXPECT_EQ(a + b, UTF8Str("a\xC3\xA9" "b"));
  EXPECT_EQ((a + b).ToVynString().PrimaryCP(), CP_UTF8);
}
