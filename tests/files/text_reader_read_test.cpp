// Reading: characters, chunks, lines and whole texts in every encoding, line-end translation and
// end-of-file characters, fed whole and one byte per read (block boundaries are where decoders
// break). Expected texts are the platform's own conversion of the same bytes, or written out.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "files/text_reader_test_support.h"

namespace {

using namespace vyn::test::text;
using VynSDK::Util::Char;
using VynSDK::Util::TextFile::LineEndCRLF;
using VynSDK::Util::TextFile::LineEndLF;
using VynSDK::Util::TextFile::LineEndNone;

const std::size_t kBlockSizes[] = {1, 2, 3, 5, 4096};

// A file's bytes in one encoding, with the default that makes the reader take that encoding.
struct Encoded {
  const char* name;
  std::string bytes;
  UINT defaultEncoding;
};

std::vector<Encoded> EveryEncoding(const std::u16string& text) {
  return {
      {"UTF-8 with mark", "\xEF\xBB\xBF" + Encode(65001, text), 0},
      {"UTF-8 by default", Encode(65001, text), 65001},
      {"UTF-16 LE with mark", "\xFF\xFE" + Utf16Bytes(text), 0},
      {"UTF-16 BE with mark", "\xFE\xFF" + Utf16Bytes(text, true), 0},
      {"UTF-16 LE by default", Utf16Bytes(text), 65012},
  };
}

// Mixed text: ASCII, Latin-1, kana, kanji, a supplementary character (two UTF-16 units, four
// UTF-8 bytes) and line ends.
const std::u16string kMixed = u"caf\u00e9 na\u00efve\r\n日本語のテキスト\r\n\U0001F600 emoji\r\nend";

TEST(TextReaderRead, EveryWayOfReadingGivesTheText) {
  for (const Encoded& file : EveryEncoding(kMixed)) {
    for (const std::size_t block : kBlockSizes) {
      SCOPED_TRACE(std::string(file.name) + ", block " + std::to_string(block));
      {
        TestReader r;
        ASSERT_TRUE(OpenOnMemory(r, file.bytes, file.defaultEncoding, LineEndNone, block));
        EXPECT_EQ(Text(r.ReadFull()), kMixed);
        EXPECT_TRUE(r.ReadFull().IsNull()) << "nothing left";
      }
      {
        TestReader r;
        ASSERT_TRUE(OpenOnMemory(r, file.bytes, file.defaultEncoding, LineEndNone, block));
        EXPECT_EQ(ReadAllChars(r), kMixed);
        EXPECT_EQ(r.Position(), 34u) << "characters, the emoji counted once";
        EXPECT_TRUE(r.IsEndOfFile());
        EXPECT_EQ(r.ReadCharUTF32(), 0xFFFFFFFFu);
      }
      {
        TestReader r;
        ASSERT_TRUE(OpenOnMemory(r, file.bytes, file.defaultEncoding, LineEndNone, block));
        const std::vector<std::u16string> lines = ReadAllLines(r);
        ASSERT_EQ(lines.size(), 4u);
        EXPECT_EQ(lines[1], u"日本語のテキスト\r\n");
        EXPECT_EQ(Joined(lines), kMixed);
        EXPECT_EQ(r.LineNumber(), 3u);
      }
      {
        TestReader r;
        ASSERT_TRUE(OpenOnMemory(r, file.bytes, file.defaultEncoding, LineEndNone, block));
        std::u16string chunks;
        for (VynSDK::Util::VynString s = r.ReadChars(3); !s.IsNull(); s = r.ReadChars(3)) chunks += Text(s);
        EXPECT_EQ(chunks, kMixed) << "chunks end on whole characters";
      }
    }
  }
}

TEST(TextReaderRead, CodePagesCharacterByCharacterAgainstThePlatform) {
  const struct {
    UINT codepage;
    std::u16string text;
  } rows[] = {
      {1252, u"Caf\u00e9 \u20ac 5\r\nna\u00efve\r\n"},
      {932, u"日本語のテキスト、半角ｶﾅ and ASCII\r\n表示\r\n"},  // 表 has the trail byte '\'
      {936, u"中文文本，简体\r\n"},
      {949, u"한국어 텍스트\r\n"},
  };
  for (const auto& row : rows) {
    const std::string bytes = Encode(row.codepage, row.text);
    const std::u16string reference = Decode(row.codepage, bytes);
    ASSERT_EQ(reference, row.text) << row.codepage;
    for (const std::size_t block : kBlockSizes) {
      SCOPED_TRACE(std::to_string(row.codepage) + ", block " + std::to_string(block));
      TestReader r;
      ASSERT_TRUE(OpenOnMemory(r, bytes, row.codepage, LineEndNone, block));
      EXPECT_EQ(r.Encoding(), row.codepage);
      EXPECT_EQ(ReadAllChars(r), reference);
      EXPECT_EQ(r.PositionBytes(), bytes.size());
      TestReader lines;
      ASSERT_TRUE(OpenOnMemory(lines, bytes, row.codepage, LineEndNone, block));
      EXPECT_EQ(Joined(ReadAllLines(lines)), reference);
    }
  }
}

// Line-end modes, with the awkward pairs split at every block boundary: the text is shifted by a
// prefix against the 8-byte detection sample and read in blocks of 1 to 5 bytes.
TEST(TextReaderRead, LineEndModesAcrossBlockBoundaries) {
  const struct {
    const char* name;
    std::u16string text;
    LineEndMode mode;
    std::u16string expected;
  } rows[] = {
      {"LF, CR, CR LF and LF CR become CR LF", u"a\nb\rc\r\nd\n\re", LineEndCRLF, u"a\r\nb\r\nc\r\nd\r\ne"},
      {"two CRs are two line ends", u"a\r\rb", LineEndCRLF, u"a\r\n\r\nb"},
      {"CR LF then LF is two line ends", u"a\r\n\nb", LineEndCRLF, u"a\r\n\r\nb"},
      {"a CR at the very end", u"x\r", LineEndCRLF, u"x\r\n"},
      {"an LF CR pair at the very end", u"x\n\r", LineEndCRLF, u"x\r\n"},
      {"CR LF only", u"\r\n", LineEndCRLF, u"\r\n"},
      {"LF mode removes every CR", u"a\r\nb\rc\n\r", LineEndLF, u"a\nbc\n"},
      {"no translation", u"a\r\nb\rc\n\r", LineEndNone, u"a\r\nb\rc\n\r"},
  };
  for (const auto& row : rows) {
    for (const char* encodingName : {"1252", "UTF-16 BE"}) {
      const bool utf16 = encodingName[0] == 'U';
      for (std::size_t prefix = 0; prefix < 9; ++prefix) {
        const std::u16string text = std::u16string(prefix, u'x') + row.text;
        const std::string bytes = utf16 ? "\xFE\xFF" + Utf16Bytes(text, true) : Encode(1252, text);
        for (const std::size_t block : kBlockSizes) {
          SCOPED_TRACE(std::string(row.name) + ", " + encodingName + ", prefix " +
                       std::to_string(prefix) + ", block " + std::to_string(block));
          TestReader r;
          r.SetDetectSize(8);
          ASSERT_TRUE(OpenOnMemory(r, bytes, 1252, row.mode, block));
          EXPECT_EQ(Text(r.ReadFull()), std::u16string(prefix, u'x') + row.expected);
          TestReader chars;
          chars.SetDetectSize(8);
          ASSERT_TRUE(OpenOnMemory(chars, bytes, 1252, row.mode, block));
          EXPECT_EQ(ReadAllChars(chars), std::u16string(prefix, u'x') + row.expected);
        }
      }
    }
  }
}

TEST(TextReaderRead, EndOfFileCharacters) {
  const std::string longTail(5000, 'z');
  const struct {
    const char* name;
    std::string bytes;
    LineEndMode mode;
    int handling;  // -1: as Open sets it
    std::string expected;
  } rows[] = {
      {"Open with CR LF mode stops at the first Ctrl-Z", "abc\x1A" "def", LineEndCRLF, -1, "abc"},
      {"and for good, also in later blocks", "abc\x1A" + longTail + "\x1A" "tail", LineEndCRLF, -1, "abc"},
      {"a Ctrl-Z beyond the first block", longTail + "\x1A" "tail", LineEndCRLF, -1, longTail},
      {"Open without translation keeps Ctrl-Z", "abc\x1A" "def", LineEndNone, -1, "abc\x1A" "def"},
      {"removing every Ctrl-Z", "a\x1A" "b\x1A" "c", LineEndNone, 2, "abc"},
      {"stopping, set after Open", "abc\x1A" "def", LineEndNone, 1, "abc"},
      {"keeping, set after Open, cannot bring back what was cut", "ab\x1A" "cd", LineEndCRLF, 0, "ab"},
  };
  for (const auto& row : rows) {
    for (const std::size_t block : kBlockSizes) {
      SCOPED_TRACE(std::string(row.name) + ", block " + std::to_string(block));
      TestReader r;
      ASSERT_TRUE(OpenOnMemory(r, row.bytes, 1252, row.mode, block));
      EXPECT_EQ(r.GetEOFCharacterHandling(), row.mode == LineEndNone ? Reader::EOFKeepText : Reader::EOFStopAtFirst);
      if (row.handling >= 0) r.SetEOFCharacterHandling(static_cast<Reader::EOFCharacterHandling>(row.handling));
      const std::u16string expected(row.expected.begin(), row.expected.end());
      EXPECT_EQ(Text(r.ReadFull()), expected);
      EXPECT_TRUE(r.IsEndOfFile());
    }
  }
  // The same in UTF-16, where the end-of-file character is the unit 0x001A.
  TestReader r;
  ASSERT_TRUE(OpenOnMemory(r, "\xFF\xFE" + Utf16Bytes(u"ab\x1A" u"cd"), 0, LineEndCRLF, 1));
  EXPECT_EQ(Text(r.ReadFull()), u"ab");
}

TEST(TextReaderRead, MalformedInputIsConsumedAndReported) {
  const struct {
    const char* name;
    std::string bytes;
    UINT encoding;
    std::vector<unsigned> codes;  // ReadCharUTF32 results until the end
  } rows[] = {
      {"stray continuation byte", "a\x80" "b", 65001, {'a', 0xFFFFFFFF, 'b'}},
      {"0xFE and 0xFF", "c\xFE\xFF", 65001, {'c', 0xFFFFFFFF, 0xFFFFFFFF}},
      {"sequence cut by an LF keeps the LF", "\xE2\x82\n" "d", 65001, {0xFFFFFFFF, '\n', 'd'}},
      {"sequence cut by the end of the text", "e\xE2\x82", 65001, {'e', 0xFFFFFFFF}},
      {"overlong forms are malformed (E0 80 8A would be an LF)", "\xE0\x80\x8A" "f\xC0\xAF", 65001,
       {0xFFFFFFFF, 'f', 0xFFFFFFFF}},
      {"five- and six-byte forms decode", "\xF8\x88\x80\x80\x80\xFC\x84\x80\x80\x80\x80", 65001,
       {0x200000, 0x4000000}},
      {"UTF-16 lead surrogate before a letter", std::string("\xFF\xFE\x3D\xD8" "a\0", 6), 0,
       {0xFFFFFFFF, 'a'}},
      {"UTF-16 odd byte at the end", std::string("\xFF\xFE" "a\0" "b", 5), 0, {'a', 0xFFFFFFFF}},
      {"UTF-16 lead surrogate at the end", std::string("\xFF\xFE" "a\0\x3D\xD8", 6), 0,
       {'a', 0xFFFFFFFF}},
      {"Shift_JIS lead byte before an LF keeps the LF", "\x93\n" "x", 932, {0x30FB, '\n', 'x'}},
  };
  for (const auto& row : rows) {
    for (const std::size_t block : {std::size_t(1), std::size_t(4096)}) {
      SCOPED_TRACE(std::string(row.name) + ", block " + std::to_string(block));
      TestReader r;
      ASSERT_TRUE(OpenOnMemory(r, row.bytes, row.encoding, LineEndNone, block));
      std::vector<unsigned> codes;
      std::vector<DWORD> errors;
      while (!r.IsEndOfFile() && codes.size() < 20) {
        r.LastError();
        codes.push_back(r.ReadCharUTF32());
        errors.push_back(r.LastErrorCode());
      }
      EXPECT_EQ(codes, row.codes);
      for (std::size_t i = 0; i < codes.size(); ++i) {
        EXPECT_EQ(errors[i], codes[i] == 0xFFFFFFFF ? Reader::ErrorInvalidChar : 0u) << i;
      }
      EXPECT_EQ(r.Position(), row.codes.size()) << "each malformed piece counts as a character";

      TestReader chars;
      ASSERT_TRUE(OpenOnMemory(chars, row.bytes, row.encoding, LineEndNone, block));
      for (const unsigned code : row.codes) {
        EXPECT_EQ(chars.ReadChar().CharCode(), code == 0xFFFFFFFF ? 0xFFFDu : code);
      }
      EXPECT_TRUE(chars.ReadChar().IsNull());
    }
  }
}

// Whichever way a text is read, the same characters, bytes and LFs are counted, malformed input
// included. (Found by fuzzing: a byte left over at the end of UTF-16 text was a character to
// ReadChar but not to ReadFull.)
TEST(TextReaderRead, EveryWayOfReadingCountsTheSame) {
  const struct {
    const char* name;
    std::string bytes;
    UINT encoding;
  } rows[] = {
      {"UTF-16 BE with a byte left over", "\xFE\xFF" + Utf16Bytes(u"\u65e5\u772c\n\u0d00", true) + "\n", 0},
      {"UTF-16 LE with lone surrogates", "\xFF\xFE" + Utf16Bytes(u"a\xD800\n\xDC00" u"b\xD83D"), 0},
      {"malformed UTF-8", "a\x80\xE2\x82\n\xF8\x88\x80\x80\x80\xFE\xC3", 65001},
      // Well-formed lines take the converting path, malformed ones the stepping path.
      {"UTF-8 four-byte characters among malformed lines",
       "\xF0\x9F\x98\x80a\r\n\xC3\xA9\xE6\x97\xA5\n\x80\xF0\x9F\x98\x80\n\xF0\x9F\x98\x80\r\r\n" +
           std::string(40, 'x') + "\xF0\x9F\x98\x80\n",
       65001},
      {"Shift_JIS with stray lead bytes", "\x93\n\x81\x20\x93", 932},
      {"zero characters", std::string("a\0b\nc\0", 7), 1252},
  };
  for (const auto& row : rows) {
    for (const std::size_t block : kBlockSizes) {
      SCOPED_TRACE(std::string(row.name) + ", block " + std::to_string(block));
      TestReader whole, lines, chars, chunks;
      for (TestReader* r : {&whole, &lines, &chars, &chunks}) {
        ASSERT_TRUE(OpenOnMemory(*r, row.bytes, row.encoding, LineEndCRLF, block));
      }
      (void)whole.ReadFull();
      ReadAllLines(lines);
      while (!chars.IsEndOfFile()) (void)chars.ReadCharUTF32();
      while (!chunks.ReadChars(3).IsNull()) {
      }
      for (TestReader* r : {&whole, &lines, &chunks}) {
        EXPECT_EQ(r->Position(), chars.Position());
        EXPECT_EQ(r->PositionBytes(), chars.PositionBytes());
        EXPECT_EQ(r->LineNumber(), chars.LineNumber());
        EXPECT_TRUE(r->IsEndOfFile());
      }
    }
  }
}

TEST(TextReaderRead, PeekingDoesNotMove) {
  TestReader r;
  ASSERT_TRUE(OpenOnMemory(r, "\xEF\xBB\xBF" "\xC3\xA9\nx", 0, LineEndNone, 1));
  EXPECT_EQ(r.ReadCharUTF32(true), 0xE9u);
  EXPECT_EQ(r.ReadChar(true), Char(0xE9u));
  EXPECT_EQ(r.Position(), 0u);
  EXPECT_EQ(r.PositionBytes(), 3u);
  EXPECT_EQ(r.ReadCharUTF32(), 0xE9u);
  EXPECT_EQ(r.PositionBytes(), 5u);
  EXPECT_EQ(r.LineNumber(), 1u) << "the next character is an LF";
  EXPECT_EQ(r.ReadChar(), Char(MCHAR(u'\n')));
  EXPECT_EQ(r.LineNumber(), 1u);
  EXPECT_EQ(r.Position(), 2u);
}

TEST(TextReaderRead, ChunksFinishTheirLastCharacter) {
  const struct {
    const char* name;
    std::string bytes;
    UINT encoding;
    std::size_t ask;
    std::u16string chunk;
    std::size_t bytesTaken;
  } rows[] = {
      {"UTF-8: the rest of a sequence", "\xC3\xA9" "b", 65001, 1, u"\u00e9", 2},
      {"UTF-8: a four-byte sequence", "\xF0\x9F\x98\x80" "b", 65001, 2, u"\U0001F600", 4},
      {"UTF-16: odd counts round down", std::string("\xFF\xFE" "a\0b\0", 6), 0, 3, u"a", 2},
      {"UTF-16: one byte still takes a character", std::string("\xFF\xFE" "a\0b\0", 6), 0, 1, u"a", 2},
      {"UTF-16: the trail of a surrogate pair", "\xFF\xFE" + Utf16Bytes(u"\U0001F600x"), 0, 2, u"\U0001F600", 4},
      {"Shift_JIS: the trail byte", Encode(932, u"日本"), 932, 1, u"日", 2},
      {"zero bytes: an empty text", "abc", 1252, 0, u"", 0},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    TestReader r;
    ASSERT_TRUE(OpenOnMemory(r, row.bytes, row.encoding, LineEndNone, 1));
    const std::size_t before = r.PositionBytes();
    const VynSDK::Util::VynString chunk = r.ReadChunk(row.ask);
    EXPECT_FALSE(chunk.IsNull());
    EXPECT_EQ(Text(chunk), row.chunk);
    EXPECT_EQ(r.PositionBytes() - before, row.bytesTaken);
  }
}

TEST(TextReaderRead, LinesTrimmedLimitedAndPositioned) {
  TestReader r;
  ASSERT_TRUE(OpenOnMemory(r, "ab\r\n\r\nlonger line\nlast", 1252, LineEndNone, 2));
  EXPECT_EQ(Text(r.ReadLine(static_cast<std::size_t>(-1), true)), u"ab");
  EXPECT_EQ(r.Position(), 4u) << "past the LF";
  EXPECT_EQ(r.LineNumber(), 1u);
  const VynSDK::Util::VynString empty = r.ReadLine(static_cast<std::size_t>(-1), true);
  EXPECT_FALSE(empty.IsNull());
  EXPECT_EQ(Text(empty), u"");
  EXPECT_EQ(Text(r.ReadLine(6)), u"longer") << "at most limit units";
  EXPECT_EQ(Text(r.ReadLine()), u" line\n");
  EXPECT_EQ(r.LineNumber(), 3u);
  EXPECT_EQ(Text(r.ReadLine()), u"last") << "the last line has no line end";
  EXPECT_TRUE(r.ReadLine().IsNull());
  EXPECT_EQ(r.LastErrorCode(), 0u);

  TestReader wide;
  ASSERT_TRUE(OpenOnMemory(wide, "\xFF\xFE" + Utf16Bytes(u"日本語\nx"), 0, LineEndNone, 1));
  EXPECT_EQ(Text(wide.ReadLine(2)), u"日本") << "the limit counts 16-bit units";
  EXPECT_EQ(Text(wide.ReadLine()), u"語\n");

  TestReader emptyFile;
  ASSERT_TRUE(OpenOnMemory(emptyFile, "", 1252, LineEndCRLF));
  EXPECT_TRUE(emptyFile.ReadLine().IsNull());
  EXPECT_TRUE(emptyFile.ReadChunk(10).IsNull());
  EXPECT_TRUE(emptyFile.ReadChar().IsNull());
  EXPECT_TRUE(emptyFile.IsEndOfFile());
}

// A Shift_JIS lead byte before a byte that cannot be its trail is a character of its own in the
// lines too: the line end after it is kept (the platform's converter would take the pair as one).
TEST(TextReaderRead, StrayLeadByteKeepsTheLineEnd) {
  for (const std::size_t block : kBlockSizes) {
    TestReader r;
    ASSERT_TRUE(OpenOnMemory(r, "a\x93\nb\x93 \x93\x40\n", 932, LineEndNone, block));
    EXPECT_EQ(ReadAllLines(r), (std::vector<std::u16string>{u"a\u30fb\n", u"b\u30fb \u90b8\n"}));
    EXPECT_EQ(r.LineNumber(), 2u);
  }
}

// A source that hands out three bytes a read (as a pipe may) reads as a file does.
TEST(TextReaderRead, SourcesThatHandOutLittleAtATime) {
  const std::string bytes = "\xFE\xFF" + Utf16Bytes(kMixed + u"\r", true);
  for (const LineEndMode mode : {LineEndNone, LineEndCRLF}) {
    TestReader expected;
    ASSERT_TRUE(OpenOnMemory(expected, bytes, 0, mode));
    TestReader r;
    ASSERT_TRUE(r.Open(new TrickleStream(bytes, 3, false), 0, mode, true));
    EXPECT_EQ(r.Encoding(), 0xA000FDF4u);
    EXPECT_EQ(Text(r.ReadFull()), Text(expected.ReadFull()));
  }
}

TEST(TextReaderRead, Counts) {
  const std::string utf16be = Utf16Bytes(u"a\U0001F600\nb\n", true);
  const struct {
    const char* name;
    std::string bytes;
    UINT encoding;
    std::size_t chars;
    std::size_t lines;
  } rows[] = {
      {"UTF-8", "a\xC3\xA9\n\xF0\x9F\x98\x80\n", 65001, 5, 2},
      {"UTF-8 with a last sequence that does not fit", "a\n\xE2\x82", 65001, 2, 1},
      {"UTF-8 stops at a zero byte", std::string("a\n\0b\n", 5), 65001, 2, 1},
      {"UTF-16 LE, a pair counted once", Utf16Bytes(u"a\U0001F600\nb\n"), 65012, 5, 2},
      {"UTF-16 BE", utf16be, 0x8000FDF4, 5, 2},
      {"UTF-16 of odd length", Utf16Bytes(u"ab") + "c", 65012, 2, 0},
      {"Shift_JIS, lead bytes take their trail", Encode(932, u"日本\n語"), 932, 4, 1},
      {"1252", "a\r\nb", 1252, 4, 1},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(Reader::NumberOfChars(row.bytes.data(), row.bytes.size(), row.encoding), row.chars);
    EXPECT_EQ(Reader::NumberOfLines(row.bytes.data(), row.bytes.size(), row.encoding), row.lines);
  }
  EXPECT_EQ(Reader::NumberOfChars(nullptr, 5, 65001), 0u);

  TestReader r;
  ASSERT_TRUE(OpenOnMemory(r, "\xEF\xBB\xBF" "a\xC3\xA9\nb\n", 0, LineEndNone));
  EXPECT_EQ(r.NumberOfChars(), 5u) << "the mark is not text";
  EXPECT_EQ(r.NumberOfLines(), 2u);
}

}  // namespace
