// Opening text writers: the byte-order marks of new files, appending in an existing file's own
// encoding, the caller's files, copies, and every last-error code with its text.

#include <gtest/gtest.h>

#include <cstdio>
#include <string>

#include "files/text_writer_test_support.h"
#include "support/process_code_pages.h"
#include "support/temp_dir.h"

namespace {

using VynSDK::Util::BinaryStream;
using VynSDK::Util::VynString;
using VynSDK::Util::TextFile::LineEndCRLF;
using VynSDK::Util::TextFile::LineEndNone;
using VynSDK::Util::TextFile::Writer;
using namespace vyn::test;

constexpr std::size_t kFailed = static_cast<std::size_t>(-1);

// A byte string with its zero bytes.
template <std::size_t N>
std::string B(const char (&bytes)[N]) {
  return std::string(bytes, N - 1);
}

}  // namespace

TEST(TextWriterOpen, NewFilesAndAppending) {
  ProcessCodePages pinned(1252, 850);
  const struct {
    const char* name;
    bool append;
    std::string before;
    UINT callerEncoding;
    UINT inUse;         // Encoding() after Open
    std::string after;  // the file after writing e acute and LF (as CR LF)
  } rows[] = {
      // New files: the marks of the UTF encodings are the round-trip test's; these are the rest.
      {"code pages get no mark", false, "old", 0x200004E4, 0x200004E4, "\xE9\r\n"},
      {"prefer UTF-8", false, "old", 0x100004E4, 65001, "\xC3\xA9\r\n"},
      {"prefer UTF-8, mark", false, "", 0x300004E4, 0x2000FDE9, "\xEF\xBB\xBF\xC3\xA9\r\n"},
      // Appending: text goes on in the file's own encoding, without a second mark.
      {"onto UTF-16LE", true, B("\xFF\xFE" "a\0"), 65001, 0x2000FDF4,
       B("\xFF\xFE" "a\0\xE9\0\r\0\n\0")},
      {"onto UTF-16BE", true, B("\xFE\xFF\0a"), 1252, 0xA000FDF4, B("\xFE\xFF\0a\0\xE9\0\r\0\n")},
      {"onto UTF-8 mark", true, "\xEF\xBB\xBF" "a", 1252, 0x2000FDE9, "\xEF\xBB\xBF" "a\xC3\xA9\r\n"},
      {"onto UTF-8", true, "\xC3\xBC", 1252, 65001, "\xC3\xBC\xC3\xA9\r\n"},
      {"onto 1252", true, "caf\xE9", 1252, 1252, "caf\xE9\xE9\r\n"},
      {"onto a declaration", true, "#coding:utf-8\n", 1252, 0x4000FDE9, "#coding:utf-8\n\xC3\xA9\r\n"},
      {"onto ASCII, prefer UTF-8", true, "abc", 0x100004E4, 65001, "abc\xC3\xA9\r\n"},
      {"onto nothing: a new file", true, "", 0x2000FDE9, 0x2000FDE9, "\xEF\xBB\xBF\xC3\xA9\r\n"},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    TempDir dir;
    const std::u16string path = dir.Write("t.txt", row.before);
    Writer writer;
    ASSERT_TRUE(writer.Open(path.c_str(), row.append, row.callerEncoding, LineEndCRLF));
    EXPECT_EQ(writer.Encoding(), row.inUse);
    if (row.append) {
      writer.Seek(0, 0);  // an appending writer writes at the end wherever the stream stands
      writer.Write(u"\u00E9\n", 2);
    } else {
      writer.Write(VynString::FromUTF16(u"\u00E9\n"));
    }
    writer.Close();
    EXPECT_EQ(Hex(FileContents(dir.path() / "t.txt")), Hex(row.after));
  }
}

TEST(TextWriterOpen, CallersFileStaysOpenAndIsNeverCut) {
  TempDir dir;
  dir.Write("t.txt", "old ");
  // Open for appending only, the file cannot be read back to find its encoding: its text is
  // still kept, and the caller's encoding taken.
  FILE* file = std::fopen((dir.path() / "t.txt").c_str(), "ab");
  ASSERT_NE(file, nullptr);
  Writer writer;
  ASSERT_TRUE(writer.Open(file, true, 1252, LineEndNone));
  EXPECT_EQ(writer.Write("new", 3), 3u);
  Writer copy(writer);  // copies share the stream
  writer.Close();
  EXPECT_EQ(copy.Write(u"!", 1), 1u);
  copy.Close();
  EXPECT_EQ(std::fputs(" after", file), 1) << "the caller's file is still open";
  std::fclose(file);
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "old new! after");
}

TEST(TextWriterOpen, LastErrorCodesAndTexts) {
  TempDir dir;
  const std::u16string path = dir.Write("t.txt", "kept");
  const std::u16string other = dir.Write("other.txt", "untouched");
  StreamWriter writer;
  EXPECT_FALSE(writer.Open(static_cast<BinaryStream*>(nullptr), false, 0, LineEndCRLF, true));
  EXPECT_EQ(TextOf(writer.LastError()), u"Invalid Open argument - NULL stream.");
  EXPECT_FALSE(writer.Open(static_cast<FILE*>(nullptr)));
  EXPECT_EQ(writer.LastErrorCode(), Writer::ErrorNullStream);

  const std::size_t notOpen[] = {writer.Write(VynString::FromUTF16(u"x")), writer.Write(u"x", 1),
                                 writer.Write("x", 1), writer.WriteChar('x'), writer.Seek(0, 0)};
  for (std::size_t result : notOpen) EXPECT_EQ(result, kFailed);
  EXPECT_EQ(TextOf(writer.LastError()), u"Stream not open.");
  EXPECT_EQ(writer.Write(static_cast<const MCHAR*>(nullptr), 5), 0u) << "null text, open or not";
  EXPECT_EQ(writer.Write(static_cast<const char*>(nullptr), 5), 0u);
  EXPECT_TRUE(writer.LastError().IsNull()) << "code 0 and no stream: the null string";

  ASSERT_TRUE(writer.Open(path.c_str(), true, 0xA000FDF4, LineEndNone));
  EXPECT_FALSE(writer.Open(other.c_str(), false, 65001, LineEndNone));
  EXPECT_EQ(TextOf(writer.LastError()), u"Stream already open.");
  EXPECT_EQ(FileContents(dir.path() / "other.txt"), "untouched") << "not even opened";
  EXPECT_EQ(writer.Printf(u"%n", nullptr), kFailed) << "%n is refused";
  EXPECT_EQ(TextOf(writer.LastError()), u"Error formatting buffer.");
  // More units than memory holds: the byte-swapped copy cannot be made.
  EXPECT_EQ(writer.Write(u"x", kFailed / 2), kFailed);
  EXPECT_EQ(TextOf(writer.LastError()), u"Error allocating memory.");
  writer.Close();
  EXPECT_EQ(writer.LastErrorCode(), 0u);
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "kept");

  // Code 0 with a stream: the stream's own text, here of a write to a file open for reading.
  ASSERT_TRUE(writer.Open(BinaryStream::FromFilename(VynString::FromUTF16(path.c_str()),
                                                     BinaryStream::ModeRead, nullptr),
                          true, 1252, LineEndNone, true));
  EXPECT_EQ(writer.Write("x", 1), 0u);
  EXPECT_EQ(TextOf(writer.LastError()), u"Access is denied.\r\n");  // ERROR_ACCESS_DENIED (5)
  Writer unopened;
  EXPECT_FALSE(unopened.Open(dir.File("missing/t.txt").c_str()));
  EXPECT_EQ(unopened.LastErrorCode(), 0u) << "a file that cannot be opened sets no code";
}
