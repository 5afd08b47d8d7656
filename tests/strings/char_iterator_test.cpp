// CharIterator: walking narrow double-byte text and wide text with surrogate pairs, and never
// stepping past the terminator.

#include <gtest/gtest.h>

#include <cstring>
#include <ostream>
#include <vector>

#include "vynutil/char.h"
#include "support/process_code_pages.h"
#include "win32/codepage.h"

using VynSDK::Util::Char;
using VynSDK::Util::CharIterator;

namespace {

struct Step {
  std::size_t offset;  // units from the start
  std::size_t length;  // CharLength
  unsigned int code;   // *it
  bool operator==(const Step&) const = default;
};

void PrintTo(const Step& s, std::ostream* os) { *os << "{" << s.offset << ", " << s.length << ", " << s.code << "}"; }

// Walks text with prefix ++ to the terminator and records every step.
template <class T>
std::vector<Step> Walk(T* text) {
  std::vector<Step> steps;
  for (CharIterator<T> it(text); *it.Get() != 0; ++it) {
    steps.push_back({static_cast<std::size_t>(it.Get() - text), it.CharLength(), (*it).CharCode()});
    if (steps.size() > 64) break;
  }
  return steps;
}

}  // namespace

TEST(CharIterator, WideTextWithSurrogatePairs) {
  const MCHAR text[] = u"x\U0001F600a\U00010400";
  // A pair takes two units and reads as '?' from its lead unit alone.
  EXPECT_EQ(Walk(text), (std::vector<Step>{{0, 1, 'x'}, {1, 2, '?'}, {3, 1, 'a'}, {4, 2, '?'}}));

  CharIterator<const MCHAR> it(text + 1);
  EXPECT_EQ(it.CharLength(), 2u);
  EXPECT_EQ((*it).CharCode(), u'?');
  EXPECT_EQ((it + 1).Get(), text + 3) << "it + 1 points at 'a'";
  EXPECT_EQ((*(it + 1)).CharCode(), u'a');
  EXPECT_EQ(it.Get(), text + 1) << "operator+ leaves the iterator where it is";

  CharIterator<const MCHAR> post(text);
  EXPECT_EQ((post++).Get(), text) << "postfix returns the old position";
  EXPECT_EQ(post.Get(), text + 1);

  // A lone trail surrogate is a character of its own, read as its value.
  const MCHAR trail[] = {0xDC00, u'b', 0};
  EXPECT_EQ(Walk(trail), (std::vector<Step>{{0, 1, 0xDC00}, {1, 1, 'b'}}));
}

TEST(CharIterator, NarrowDoubleByteText) {
  const ProcessCodePages japanese(932, 932);
  // Shift-JIS: "A", U+3042 (82 A0), U+FF71 half-width katakana (B1), U+4E00 (88 EA), "z".
  const char text[] = "A\x82\xA0\xB1\x88\xEAz";
  EXPECT_EQ(Walk(text), (std::vector<Step>{{0, 1, 'A'}, {1, 2, '?'}, {3, 1, 0xFF71}, {4, 2, '?'}, {6, 1, 'z'}}));

  CharIterator<const char> it(text);
  it += 2;
  EXPECT_EQ(it.Get(), text + 3);
  EXPECT_EQ((it + 2).Get(), text + 6);
}

TEST(CharIterator, SingleByteAndUtf8ActiveCodePages) {
  const char text[] = "a\xE9\x80";  // 1252: a, U+00E9, U+20AC
  EXPECT_EQ(Walk(text), (std::vector<Step>{{0, 1, 'a'}, {1, 1, 0xE9}, {2, 1, 0x20AC}}));

  // A UTF-8 process has no double-byte lead bytes: a unit a step, every byte of a sequence '?'.
  const ProcessCodePages utf8(CP_UTF8, CP_UTF8);
  const char e[] = "\xC3\xA9" "b";
  EXPECT_EQ(Walk(e), (std::vector<Step>{{0, 1, '?'}, {1, 1, '?'}, {2, 1, 'b'}}));
}

TEST(CharIterator, NeverPastTheTerminator) {
  {
    // Heap copies of exactly the text: the address sanitizer sees any read beyond them.
    MCHAR* wide = new MCHAR[3]{u'a', 0xD83D, 0};
    CharIterator<MCHAR> it(wide);
    it += 10;
    EXPECT_EQ(it.Get(), wide + 2) << "a lead surrogate before the terminator is one unit";
    EXPECT_EQ((*it).CharCode(), 0u);
    EXPECT_EQ((++it).Get(), wide + 2) << "on the terminator, ++ stays";
    EXPECT_EQ((it + 5).Get(), wide + 2);
    CharIterator<MCHAR> lead(wide + 1);
    EXPECT_EQ(lead.CharLength(), 1u);
    delete[] wide;
  }
  {
    const ProcessCodePages japanese(932, 932);
    char* narrow = new char[3]{'a', '\x82', '\0'};
    CharIterator<char> it(narrow + 1);
    EXPECT_EQ(it.CharLength(), 1u) << "a lead byte before the terminator is one unit";
    EXPECT_EQ((*it).CharCode(), u'?');
    ++it;
    EXPECT_EQ(it.Get(), narrow + 2);
    it++;
    EXPECT_EQ(it.Get(), narrow + 2);
    delete[] narrow;
  }
  CharIterator<const char> none;
  EXPECT_EQ((*none).CharCode(), 0u) << "null text reads as the terminator";
  EXPECT_EQ((none + 3).Get(), nullptr);
}
