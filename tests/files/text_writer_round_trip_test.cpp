// Text written by the Writer reads back unchanged through the text reader, in every encoding the
// writer supports and with every line-end mode. The file's bytes are checked against iconv's
// encoding of the same text, so writer and reader cannot agree on a wrong encoding.

#include <gtest/gtest.h>

#include <string>

#include "files/text_writer_test_support.h"
#include "support/process_code_pages.h"
#include "support/temp_dir.h"

namespace {

using VynSDK::Util::TextFile::LineEndCRLF;
using VynSDK::Util::TextFile::LineEndLF;
using VynSDK::Util::TextFile::LineEndMode;
using VynSDK::Util::TextFile::LineEndNone;
using namespace vyn::test;

// Five lines of text each (UTF-8).
const char* const kWorld[] = {"Gr\u00FC\u00DFe", "\u4E16\u754C", "\U0001F600 emoji", "\u00E9t\u00E9", "end"};
const char* const kAscii[] = {"Plain words", "and more of them", "with a line", "after another", "end"};
const char* const kLatin[] = {"Caf\u00E9", "\u20AC 5", "na\u00EFve \u00C6sop", "\u201Cq\u201D", "end"};
const char* const kJapanese[] = {"\u65E5\u672C\u8A9E", "\u3072\u3089", "\uFF76\uFF80\uFF76\uFF85", "\u8868", "end"};
const char* const kSimplified[] = {"\u4E2D\u6587", "\u6587\u672C", "\u6C49\u5B57", "\u6D4B\u8BD5", "end"};
const char* const kKorean[] = {"\uD55C\uAD6D\uC5B4", "\uD14D\uC2A4\uD2B8", "\uC548\uB155", "\uAC00", "end"};
const char* const kTraditional[] = {"\u7E41\u9AD4", "\u4E2D\u6587", "\u6E2C\u8A66", "\u81FA\u7063", "end"};

// Byte-order marks: EF BB BF (UTF-8), FF FE (UTF-16LE), FE FF (UTF-16BE), as the Unicode FAQ
// "UTF-8, UTF-16, UTF-32 & BOM" lists them. The reader finds every UTF encoding by itself (from a
// default of 1252). Code-page text cannot be told from other code-page text (1252 bytes are also
// 932 bytes), so those files are read with their code page given.
const struct {
  const char* name;
  UINT word;              // the writer's encoding word
  const char* iconvName;  // the same encoding for iconv
  const char* mark;
  const char* const* lines;
  bool detected;
} kEncodings[] = {
    {"UTF-8 with mark", 0x2000FDE9, "UTF-8", "\xEF\xBB\xBF", kWorld, true},
    {"UTF-8", 65001, "UTF-8", "", kWorld, true},
    {"UTF-16LE with mark", 0x2000FDF4, "UTF-16LE", "\xFF\xFE", kWorld, true},
    {"UTF-16BE with mark", 0xA000FDF4, "UTF-16BE", "\xFE\xFF", kWorld, true},
    {"UTF-16LE", 65012, "UTF-16LE", "", kAscii, true},
    {"UTF-16BE", 0x8000FDF4, "UTF-16BE", "", kAscii, true},
    {"1252", 1252, "CP1252", "", kLatin, false},
    {"932", 932, "CP932", "", kJapanese, false},
    {"936", 936, "CP936", "", kSimplified, false},
    {"949", 949, "CP949", "", kKorean, false},
    {"950", 950, "CP950", "", kTraditional, false},
};

// The lines joined by every kind of line end the writer translates (LineEndNone), or as the mode
// writes them: LineEndCRLF every line end CR LF, LineEndLF every line end LF.
std::string Joined(const char* const* lines, LineEndMode mode) {
  const char* ends[] = {"\n", "\r\n", "\r", "\n\r", "\n"};
  std::string text;
  for (int i = 0; i < 5; ++i) {
    text += lines[i];
    text += mode == LineEndCRLF ? "\r\n" : mode == LineEndLF ? "\n" : ends[i];
  }
  return text;
}

}  // namespace

TEST(TextWriterRoundTrip, EveryEncodingAndLineEndMode) {
  ProcessCodePages pinned(1252, 850);
  for (const auto& e : kEncodings) {
    for (LineEndMode mode : {LineEndNone, LineEndCRLF, LineEndLF}) {
      SCOPED_TRACE(std::string(e.name) + ", line-end mode " + std::to_string(mode));
      TempDir dir;
      const std::u16string path = dir.File("text.txt");
      VynSDK::Util::TextFile::Writer writer;
      ASSERT_TRUE(writer.Open(path.c_str(), false, e.word, mode));
      const std::u16string text = U16(Joined(e.lines, LineEndNone));
      ASSERT_NE(writer.Write(text.c_str(), text.size()), static_cast<std::size_t>(-1));
      writer.Close();

      const std::string expected = Joined(e.lines, mode);
      EXPECT_EQ(Hex(FileContents(dir.path() / "text.txt")),
                Hex(e.mark + Iconv(expected, e.iconvName)));
      VynSDK::Util::TextFile::Reader reader;
      ASSERT_TRUE(reader.Open(path.c_str(), e.detected ? 1252 : e.word, mode));
      EXPECT_EQ(TextOf(reader.ReadFull()), U16(expected));
      EXPECT_EQ(reader.Encoding() & 0xA000FFFF, e.word & 0xA000FFFF) << "code page, mark, order";
    }
  }
}
