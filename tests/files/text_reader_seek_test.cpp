// Positions, seeking by characters (inside the buffer and from the start of the source), putting
// text back, and copies of readers. After any seek the rest of the text must read as the suffix of
// the text from that character on, and the line number must count the LFs before it.

#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "files/text_reader_test_support.h"

namespace {

using namespace vyn::test::text;
using VynSDK::Util::Char;
using VynSDK::Util::VynString;
using VynSDK::Util::TextFile::LineEndCRLF;
using VynSDK::Util::TextFile::LineEndNone;

const std::u16string kText = u"first line\r\nzweite Zeile \u00e4\u00f6\r\n三行目\U0001F600\r\nend";

// The text as code points, so that a character position indexes it.
std::u32string CodePoints(const std::u16string& text) {
  std::u32string out;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char16_t u = text[i];
    if ((u & 0xFC00) == 0xD800 && i + 1 < text.size()) {
      out += static_cast<char32_t>(((u - 0xD800) << 10) + (text[++i] - 0xDC00) + 0x10000);
    } else {
      out += u;
    }
  }
  return out;
}

std::u16string Utf16(const std::u32string& points) {
  std::u16string out;
  for (const char32_t c : points) {
    MCHAR units[3] = {};
    out.append(units, Char(static_cast<unsigned>(c)).ToUTF16(units, 3));
  }
  return out;
}

std::size_t LineFeedsBefore(const std::u32string& points, std::size_t position) {
  std::size_t n = 0;
  for (std::size_t i = 0; i < position && i < points.size(); ++i) n += points[i] == U'\n';
  return n;
}

struct Source {
  const char* name;
  std::string bytes;
  UINT encoding;
};

std::vector<Source> Sources() {
  return {
      {"UTF-8", "\xEF\xBB\xBF" + Encode(65001, kText), 0},
      {"UTF-16 BE", "\xFE\xFF" + Utf16Bytes(kText, true), 0},
      {"Shift_JIS", Encode(932, u"first line\r\n三行目\r\nend"), 932},
  };
}

// Every target from every reading state: forward, back inside the buffer, back beyond it.
TEST(TextReaderSeek, EveryTargetReadsTheRestOfTheText) {
  for (const Source& source : Sources()) {
    TestReader probe;
    ASSERT_TRUE(OpenOnMemory(probe, source.bytes, source.encoding, LineEndNone));
    const std::u32string points = CodePoints(Text(probe.ReadFull()));
    for (const std::size_t block : {std::size_t(1), std::size_t(7), std::size_t(4096)}) {
      for (std::size_t from = 0; from <= points.size(); from += 5) {
        for (std::size_t to = 0; to <= points.size() + 1; ++to) {
          SCOPED_TRACE(std::string(source.name) + ", block " + std::to_string(block) + ", from " +
                       std::to_string(from) + " to " + std::to_string(to));
          TestReader r;
          r.SetDetectSize(8);
          ASSERT_TRUE(OpenOnMemory(r, source.bytes, source.encoding, LineEndNone, block));
          ASSERT_EQ(r.SeekToAbsolute(from), from);
          const std::size_t expected = std::min(to, points.size());
          ASSERT_EQ(r.Seek(static_cast<LONG>(to), 0), expected);
          EXPECT_EQ(r.Position(), expected);
          EXPECT_EQ(r.LastErrorCode(), 0u);
          const std::size_t next = expected < points.size() && points[expected] == U'\n' ? 1 : 0;
          EXPECT_EQ(r.LineNumber(), LineFeedsBefore(points, expected) + next);
          EXPECT_EQ(Text(r.ReadFull()), Utf16(points.substr(expected)));
        }
      }
    }
  }
}

TEST(TextReaderSeek, OriginsAndClamping) {
  TestReader r;
  ASSERT_TRUE(OpenOnMemory(r, "0123456789", 1252, LineEndNone));
  EXPECT_EQ(r.Seek(4, 1), 4u) << "forward from the current position";
  EXPECT_EQ(r.Seek(-3, 1), 1u) << "back from the current position";
  EXPECT_EQ(r.Seek(-30, 1), 0u) << "not before the start";
  EXPECT_EQ(r.Seek(-2, 2), 8u) << "from the end";
  EXPECT_EQ(r.Seek(5, 2), 10u) << "not past the end";
  EXPECT_EQ(r.Seek(-30, 2), 0u);
  EXPECT_EQ(r.Seek(-5, 0), 0u) << "a negative absolute target is the start";
  EXPECT_EQ(r.Seek(99, 0), 10u);
  EXPECT_TRUE(r.IsEndOfFile());
  EXPECT_EQ(r.Seek(3, 0), 3u);
  EXPECT_EQ(Text(r.ReadChars(2)), u"34");
}

TEST(TextReaderSeek, BackwardSeekNeedsASeekableSource) {
  const std::string bytes = std::string(50, 'a') + "bcdef";
  TestReader pipe;
  pipe.SetReadBufferSize(4);
  pipe.SetDetectSize(8);
  ASSERT_TRUE(pipe.Open(new TrickleStream(bytes, 4, false), 1252, LineEndNone, true));
  EXPECT_EQ(pipe.Seek(52, 0), 52u);
  EXPECT_EQ(pipe.Seek(51, 0), 51u) << "one character back lies in the buffer";
  EXPECT_EQ(pipe.Seek(2, 0), 51u) << "the start does not: the position stays";
  EXPECT_EQ(pipe.LastErrorCode(), Reader::ErrorSeekImpossible);
  EXPECT_EQ(pipe.LastError().IsNull(), false) << "the source's own text";
  EXPECT_EQ(pipe.LastErrorCode(), 0u) << "LastError clears the code";
  EXPECT_EQ(Text(pipe.ReadFull()), u"cdef");

  TestReader file;
  file.SetReadBufferSize(4);
  file.SetDetectSize(8);
  ASSERT_TRUE(file.Open(new TrickleStream(bytes, 4, true), 1252, LineEndNone, true));
  EXPECT_EQ(file.Seek(52, 0), 52u);
  EXPECT_EQ(file.Seek(2, 0), 2u) << "read again from the start";
  EXPECT_EQ(file.PositionBytes(), 2u);
  EXPECT_EQ(Text(file.ReadFull()), u"" + std::u16string(48, u'a') + u"bcdef");
}

// Seeking back from the start of the source re-reads it with the same filtering.
TEST(TextReaderSeek, RestartKeepsTheMarkAndTheLineEnds) {
  const std::string bytes = "\xFE\xFF" + Utf16Bytes(u"a\rb\nc\r\nd" + std::u16string(40, u'e'), true);
  TestReader r;
  r.SetReadBufferSize(2);
  r.SetDetectSize(8);
  ASSERT_TRUE(OpenOnMemory(r, bytes, 0, LineEndCRLF, 2));
  const std::u16string all = Text(r.ReadFull());
  EXPECT_EQ(all.substr(0, 10), u"a\r\nb\r\nc\r\nd");
  EXPECT_EQ(r.Seek(1, 0), 1u);
  EXPECT_EQ(r.PositionBytes(), 4u) << "the mark and one unit";
  EXPECT_EQ(r.LineNumber(), 0u);
  EXPECT_EQ(Text(r.ReadFull()), all.substr(1));
}

TEST(TextReaderSeek, UnreadPutsTextBack) {
  for (const Source& source : Sources()) {
    for (const std::size_t block : {std::size_t(1), std::size_t(4096)}) {
      SCOPED_TRACE(std::string(source.name) + ", block " + std::to_string(block));
      TestReader r;
      ASSERT_TRUE(OpenOnMemory(r, source.bytes, source.encoding, LineEndNone, block));
      EXPECT_EQ(Text(r.ReadLine()), u"first line\r\n");
      const std::size_t bytesBefore = r.PositionBytes();
      EXPECT_EQ(r.Unread(VynString::FromUTF16(u"x\n三")), 3u);
      EXPECT_EQ(r.Position(), 9u);
      EXPECT_EQ(r.LineNumber(), 0u) << "the LF put back is no longer handed out";
      EXPECT_LT(r.PositionBytes(), bytesBefore);
      EXPECT_EQ(r.UnreadChar(Char(0x76EEu)), 1u);
      const std::u16string rest = Text(r.ReadFull());
      EXPECT_EQ(rest.substr(0, 4), u"目x\n三");
      EXPECT_EQ(r.Unread(VynString()), 0u);
      EXPECT_EQ(r.Unread(VynString::FromUTF16(u"")), 0u);
      EXPECT_EQ(r.UnreadChar(Char()), 0u);
    }
  }
  // More than was read: the buffer makes room in front, and positions stop at 0.
  TestReader r;
  ASSERT_TRUE(OpenOnMemory(r, "bc", 1252, LineEndNone));
  EXPECT_EQ(r.ReadChar(), Char(MCHAR(u'b')));
  EXPECT_EQ(r.Unread(VynString::FromUTF16(u"0123456789a")), 11u);
  EXPECT_EQ(r.Position(), 0u);
  EXPECT_EQ(r.PositionBytes(), 0u);
  EXPECT_EQ(Text(r.ReadFull()), u"0123456789ac");
}

TEST(TextReaderSeek, CopiesAreIndependentReadersOfOneSource) {
  vyn::test::TempDir dir;
  std::u16string text;
  for (int i = 0; i < 2000; ++i) text += u"line " + std::u16string(1, u'a' + i % 26) + u"\r\n";
  const std::u16string path = dir.Write("copy.txt", Encode(1252, text));

  auto original = std::make_unique<Reader>();
  original->SetReadBufferSize(64);
  ASSERT_TRUE(original->Open(path.c_str(), 1252, LineEndNone));
  EXPECT_EQ(Text(original->ReadLine()), u"line a\r\n");
  Reader copy(*original);
  Reader assigned;
  assigned = *original;
  EXPECT_EQ(copy.Position(), 8u);
  // Reading alternately: each sees the whole rest of the text.
  std::u16string fromOriginal, fromCopy;
  for (int i = 0; i < 1999; ++i) {
    fromOriginal += Text(original->ReadLine());
    fromCopy += Text(copy.ReadLine());
  }
  EXPECT_EQ(fromOriginal, text.substr(8));
  EXPECT_EQ(fromCopy, text.substr(8));
  original.reset();  // the source stays open for the copies
  EXPECT_EQ(Text(assigned.ReadFull()), text.substr(8));
  EXPECT_EQ(copy.Seek(0, 0), 0u);
  EXPECT_EQ(Text(copy.ReadLine()), u"line a\r\n");
  assigned = copy;
  assigned = assigned;
  copy.Close();
  EXPECT_EQ(Text(assigned.ReadLine()), u"line b\r\n");
}

}  // namespace
