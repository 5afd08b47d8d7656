// The read-write text file: read, change and write back in the file's own encoding; reading,
// seeking and putting back; the open flags; line ends; text the round trip must not lose; copies.

#include <gtest/gtest.h>

#include <string>

#include "files/text_writer_test_support.h"
#include "support/process_code_pages.h"
#include "support/temp_dir.h"

namespace {

using VynSDK::Util::BinaryStream;
using VynSDK::Util::Char;
using VynSDK::Util::VynString;
using VynSDK::Util::TextFile::LineEndCRLF;
using VynSDK::Util::TextFile::LineEndLF;
using VynSDK::Util::TextFile::LineEndNone;
using VynSDK::Util::TextFile::ReaderWriter;
using namespace vyn::test;

constexpr std::size_t kAll = static_cast<std::size_t>(-1);

std::string Utf16LE(const std::u16string& text) {
  std::string bytes;
  for (char16_t unit : text) {
    bytes += static_cast<char>(unit & 0xFF);
    bytes += static_cast<char>(unit >> 8);
  }
  return bytes;
}

}  // namespace

TEST(TextReaderWriter, ChangesAreWrittenBackInTheFilesEncoding) {
  ProcessCodePages pinned(1252, 850);
  const struct {
    const char* name;
    const char* iconvName;
    const char* mark;
    UINT encoding;  // the caller's default: detection decides the first four
    const char* before;
    const char* after;  // the second line's first two characters overwritten with "XY"
  } rows[] = {
      {"UTF-8 with mark", "UTF-8", "\xEF\xBB\xBF", 1252, "\u00E9t\u00E9\n\u4E16\u754C!\n",
       "\u00E9t\u00E9\nXY!\n"},
      {"UTF-8", "UTF-8", "", 1252, "\u00E9t\u00E9\n\U0001F600\u754C!\n", "\u00E9t\u00E9\nXY!\n"},
      {"UTF-16LE with mark", "UTF-16LE", "\xFF\xFE", 1252, "a\r\n\U0001F600\u754C!\r\nz",
       "a\r\nXY!\r\nz"},
      {"UTF-16BE with mark", "UTF-16BE", "\xFE\xFF", 1252, "a\n\u00E9\u00E8!\n", "a\nXY!\n"},
      {"1252", "CP1252", "", 1252, "caf\u00E9\n\u20AC\u00E6!\n", "caf\u00E9\nXY!\n"},
      {"932", "CP932", "", 932, "\u65E5\u672C\n\uFF76\u8A9E!\n", "\u65E5\u672C\nXY!\n"},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    TempDir dir;
    const std::u16string path = dir.Write("t.txt", row.mark + Iconv(row.before, row.iconvName));
    ReaderWriter file;
    ASSERT_TRUE(file.Open(path.c_str(), ReaderWriter::OpenDefault, row.encoding, LineEndNone));
    EXPECT_FALSE(TextOf(file.ReadLine()).empty());
    EXPECT_EQ(file.Write(u"XY", 2), 2u);
    file.Close();
    EXPECT_EQ(Hex(FileContents(dir.path() / "t.txt")),
              Hex(row.mark + Iconv(row.after, row.iconvName)));
  }
}

TEST(TextReaderWriter, ReadingSeekingAndPuttingBack) {
  TempDir dir;
  const std::u16string path = dir.Write("t.txt", "ab\r\ncd\nef");
  StreamReaderWriter file;
  ASSERT_TRUE(file.Open(path.c_str(), ReaderWriter::OpenDefault, 65001, LineEndNone));
  EXPECT_EQ(file.ReadCharUTF32(true), u'a');
  EXPECT_EQ(file.Position(), 0u);
  EXPECT_EQ(file.ReadCharUTF32(), u'a');
  EXPECT_EQ(file.ReadChar(), Char(u'b'));
  EXPECT_EQ(TextOf(file.ReadLine(kAll, true)), u"") << "CR LF trimmed";
  EXPECT_EQ(file.Position(), 4u);
  EXPECT_EQ(TextOf(file.ReadChars(3)), u"cd\n");
  EXPECT_EQ(file.LineNumber(), 2u) << "LFs before the write position, which follows reading";
  EXPECT_EQ(TextOf(file.ReadLine(1)), u"e");
  EXPECT_EQ(TextOf(file.ReadLine()), u"f");
  EXPECT_TRUE(file.IsEndOfFile());
  EXPECT_EQ(file.ReadCharUTF32(), 0xFFFFFFFFu);
  EXPECT_TRUE(file.ReadChar().IsNull());
  EXPECT_TRUE(file.ReadChars(2).IsNull());
  EXPECT_TRUE(file.ReadLine().IsNull());

  const struct {
    LONG offset;
    int origin;
    std::size_t position;
  } seeks[] = {
      {2, 0, 2}, {-1, 1, 1}, {-100, 1, 0}, {-3, 2, 6}, {100, 0, 9},
      {-100, 2, 0},  // kept within the text: before the start is the start
      {-1, 0, 0},  {5, 7, 5}, // any other origin counts from the read position
  };
  for (const auto& seek : seeks) {
    EXPECT_EQ(file.Seek(seek.offset, seek.origin), seek.position)
        << seek.offset << " from " << seek.origin;
    EXPECT_EQ(file.WritePosition(), seek.position);
  }
  EXPECT_EQ(file.SeekToEnd(), 9u);

  file.Seek(1, 0);
  EXPECT_FALSE(file.IsModified());
  EXPECT_EQ(file.UnreadChar(Char(u'Z')), 1u);  // in place of the 'a' just before
  EXPECT_EQ(file.Unread(VynString::FromUTF16(u"\U0001F600-")), 2u);  // room made in front
  EXPECT_EQ(file.UnreadChar(Char()), 0u);
  EXPECT_EQ(file.Position(), 0u);
  EXPECT_EQ(TextOf(file.ReadChars(kAll)), u"\U0001F600-Zb\r\ncd\nef");
  EXPECT_TRUE(file.IsModified());
  file.Close();
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "\xF0\x9F\x98\x80-Zb\r\ncd\nef");
}

TEST(TextReaderWriter, OpenFlags) {
  TempDir dir;
  const std::u16string path = dir.Write("t.txt", "one\ntwo\n");
  // Made and released on the shared heap like every SDK object; both bases bring the operators.
  delete new ReaderWriter;
  ReaderWriter file;
  EXPECT_EQ(file.Write(u"x", 1), kAll) << "nothing open";
  EXPECT_EQ(file.Write("x", 1), kAll);
  EXPECT_FALSE(file.CanWrite());

  // Append: writes go to the end whatever is read or sought.
  ASSERT_TRUE(file.Open(path.c_str(), ReaderWriter::OpenAppend, 65001, LineEndNone));
  EXPECT_TRUE(file.CanWrite());
  EXPECT_EQ(TextOf(file.ReadLine()), u"one\n");
  file.Seek(0, 0);
  EXPECT_EQ(file.LineNumber(), 2u);
  file.Write("three\n", kAll);
  EXPECT_EQ(file.Position(), 14u) << "reading goes on after what was written";
  file.Close();
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "one\ntwo\nthree\n");

  // Truncate: the file and the text start empty.
  ASSERT_TRUE(file.Open(path.c_str(), ReaderWriter::OpenTruncate, 0x2000FDE9, LineEndNone));
  EXPECT_EQ(file.Length(), 0u);
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "");
  file.Write(u"new", 3);
  file.Close();
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "\xEF\xBB\xBFnew");

  const std::u16string missing = dir.File("missing.txt");
  EXPECT_FALSE(file.Open(missing.c_str())) << "without ModeCreate a missing file is an error";
  ASSERT_TRUE(file.Open(missing.c_str(), BinaryStream::ModeCreate, 0x100004E4));
  EXPECT_EQ(file.Encoding(), 65001u) << "prefer UTF-8: an empty file is valid UTF-8";
  file.Close();
  EXPECT_TRUE(std::filesystem::exists(dir.path() / "missing.txt"));
}

TEST(TextReaderWriter, LineEndModes) {
  const struct {
    const char* name;
    std::string before;
    decltype(LineEndNone) mode;
    std::u16string held;   // the whole text as read after Open
    std::string after;     // the file after writing "x\n" in two pieces, CR and LF, at the end
  } rows[] = {
      {"CR LF", "a\r\nb\rc\n\rd", LineEndCRLF, u"a\nb\nc\nd", "a\r\nb\r\nc\r\nd\r\nx\r\n"},
      {"LF", "a\r\nb\rc\n\rd", LineEndLF, u"a\nbc\nd", "a\nbc\nd\nx\n"},
      {"none", "a\r\nb\rc\n\rd", LineEndNone, u"a\r\nb\rc\n\rd", "a\r\nb\rc\n\rd\r\nx\r\n"},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    TempDir dir;
    const std::u16string path = dir.Write("t.txt", row.before);
    ReaderWriter file;
    ASSERT_TRUE(file.Open(path.c_str(), ReaderWriter::OpenDefault, 65001, row.mode));
    EXPECT_EQ(TextOf(file.ReadChars(kAll)), row.held);
    file.Write(u"\r\nx\r", 4);
    file.Write(u"\n", 1);  // completes the CR LF that the last write ended with
    file.Close();
    EXPECT_EQ(Hex(FileContents(dir.path() / "t.txt")), Hex(row.after));
  }
}

TEST(TextReaderWriter, NothingOfTheFileIsLost) {
  TempDir dir;
  // End-of-file characters, zero units and a lone lead surrogate, in UTF-16 and in UTF-8.
  const std::u16string units(u"a\x1A" u"b\0c\xD800" u"d", 7);
  const std::u16string path = dir.Write("u16.txt", "\xFF\xFE" + Utf16LE(units));
  const std::u16string utf8 = dir.Write("u8.txt", std::string("\xC3\xA9\x1A\0z", 5));
  for (const std::u16string* file : {&path, &utf8}) {
    const std::string before = FileContents(std::filesystem::path(*file));
    ReaderWriter text;
    ASSERT_TRUE(text.Open(file->c_str(), ReaderWriter::OpenDefault, 65001, LineEndCRLF));
    text.SeekToEnd();
    text.Write("!", 1);
    text.Close();
    const std::string bang = file == &path ? std::string("!\0", 2) : "!";
    EXPECT_EQ(Hex(FileContents(std::filesystem::path(*file))), Hex(before + bang));
  }
}

TEST(TextReaderWriter, FlushCopiesAndUnchangedFiles) {
  TempDir dir;
  const std::u16string path = dir.Write("t.txt", "line\n");
  {
    // Not changed: not written back, although LineEndCRLF would write the line end as CR LF.
    ReaderWriter file;
    ASSERT_TRUE(file.Open(path.c_str(), ReaderWriter::OpenDefault, 65001, LineEndCRLF));
    EXPECT_EQ(TextOf(file.ReadLine()), u"line\n");
  }
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "line\n");

  ReaderWriter first;
  ASSERT_TRUE(first.Open(path.c_str(), ReaderWriter::OpenDefault, 65001, LineEndNone));
  first.SeekToEnd();
  first.Write(u"1", 1);
  first.Flush();
  EXPECT_FALSE(first.IsModified());
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "line\n1");

  ReaderWriter copy(first);  // its own text over the same stream
  copy.Write(u"2", 1);
  EXPECT_EQ(first.Length(), 6u);
  first.Write(u"A", 1);
  first.Close();
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "line\n1A");
  EXPECT_TRUE(copy.IsFileOpen());
  ReaderWriter last;
  last = copy;
  copy.Close();
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "line\n12");
  last.Write(u"3", 1);
  last.Close();  // deletes the stream, once
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "line\n123");
}
