// Writing text: line-end translation checked against a plain reading of the rule (also for text
// written in pieces), narrow and wide text into every kind of encoding, and the results.

#include <gtest/gtest.h>

#include <cstdlib>
#include <random>
#include <string>

#include "files/text_writer_test_support.h"
#include "support/process_code_pages.h"
#include "support/temp_dir.h"

namespace {

using VynSDK::Util::BinaryStream;
using VynSDK::Util::VynString;
using VynSDK::Util::TextFile::LineEndCRLF;
using VynSDK::Util::TextFile::LineEndLF;
using VynSDK::Util::TextFile::LineEndMode;
using VynSDK::Util::TextFile::LineEndNone;
using namespace vyn::test;

// The plain reading of the rule: CR LF, LF CR, a lone CR and a lone LF are each one line end,
// written as CR LF (LineEndCRLF) or LF (LineEndLF).
std::string Reference(const std::string& text, LineEndMode mode) {
  if (mode == LineEndNone) return text;
  std::string out;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char c = text[i];
    if (c != '\r' && c != '\n') {
      out += c;
      continue;
    }
    out += mode == LineEndCRLF ? "\r\n" : "\n";
    if (i + 1 < text.size() && text[i + 1] == (c == '\r' ? '\n' : '\r')) ++i;
  }
  return out;
}

// UTF-16 of ASCII text, in either byte order.
std::string Utf16(const std::string& ascii, bool bigEndian) {
  std::string out;
  for (char c : ascii) out += bigEndian ? std::string{'\0', c} : std::string{c, '\0'};
  return out;
}

// Writes ASCII text to a memory stream in the pieces that cuts (positions) gives, in one form
// (0 narrow, 1 wide, 2 VynString), and returns the stream's bytes.
std::string Written(UINT encoding, LineEndMode mode, const std::string& text,
                    const std::vector<std::size_t>& cuts, int form) {
  MemoryStreamPtr stream(BinaryStream::FromMemory(nullptr, 0, std::realloc, std::free));
  StreamWriter writer;
  EXPECT_TRUE(writer.Open(stream.get(), false, encoding, mode, false));
  std::size_t start = 0;
  for (std::size_t i = 0; i <= cuts.size(); ++i) {
    const std::size_t end = i < cuts.size() ? cuts[i] : text.size();
    const std::string piece = text.substr(start, end - start);
    const std::u16string wide(piece.begin(), piece.end());
    if (form == 0) writer.Write(piece.c_str(), piece.size());
    if (form == 1) writer.Write(wide.c_str(), wide.size());
    if (form == 2) writer.Write(VynString::FromUTF16(wide.c_str(), wide.size()));
    start = end;
  }
  writer.Close();
  return std::string(static_cast<const char*>(stream->Data()), stream->Length());
}

}  // namespace

TEST(TextWriterWrite, LineEndsWholeAndInPieces) {
  ProcessCodePages pinned(1252, 850);
  const struct {
    const char* text;
    LineEndMode mode;
    const char* expected;
  } rows[] = {
      {"a\nb\r\nc\r", LineEndCRLF, "a\r\nb\r\nc\r\n"},  // every kind becomes CR LF
      {"a\n\rb\r\r\n", LineEndCRLF, "a\r\nb\r\n\r\n"},   // LF CR is one line end, CR CR two
      {"a\r\nb\n\rc\rd\n", LineEndLF, "a\nb\nc\nd\n"},
      {"a\r\nb\n\rc\r", LineEndNone, "a\r\nb\n\rc\r"},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(Reference(row.text, row.mode), row.expected) << "the reference itself";
    for (int form = 0; form < 3; ++form) {
      EXPECT_EQ(Written(1252, row.mode, row.text, {}, form), row.expected) << form;
    }
  }
  // A line end split between writes is still one line end: any pieces give the whole's bytes.
  std::mt19937 random(20240611);
  for (int round = 0; round < 200; ++round) {
    std::string text;
    for (int i = 0; i < 12; ++i) text += "a\r\n"[random() % 3];
    std::vector<std::size_t> cuts;
    for (std::size_t i = 1; i < text.size(); ++i) {
      if (random() % 2 == 0) cuts.push_back(i);
    }
    for (LineEndMode mode : {LineEndCRLF, LineEndLF}) {
      const std::string expected = Reference(text, mode);
      for (int form = 0; form < 3; ++form) {
        EXPECT_EQ(Hex(Written(65001, mode, text, cuts, form)), Hex(expected)) << Hex(text);
      }
      EXPECT_EQ(Hex(Written(0x8000FDF4, mode, text, cuts, 1)), Hex(Utf16(expected, true)));
      EXPECT_EQ(Hex(Written(65012, mode, text, cuts, 0)), Hex(Utf16(expected, false)));
    }
  }
}

TEST(TextWriterWrite, NarrowAndWideTextIntoEachEncoding) {
  const struct {
    const char* name;
    UINT acp;
    UINT encoding;
    std::string narrow;   // narrow text written, or
    std::u16string wide;  // wide text written
    std::string file;     // the bytes written, which Write returns the count of
  } rows[] = {
      // In the writer's own code page narrow bytes go out as they are, a lone lead byte too.
      {"932 as is", 932, 932, "\x93\xFA\x96\x7B\x82", u"", "\x93\xFA\x96\x7B\x82"},
      {"932 to UTF-8", 932, 65001, "\x93\xFA\x96\x7B", u"", "\xE6\x97\xA5\xE6\x9C\xAC"},  // 日本
      {"1252 to UTF-8", 1252, 65001, "caf\xE9", u"", "caf\xC3\xA9"},
      {"1252 to UTF-16", 1252, 65012, "\xE9", u"", std::string("\xE9\0", 2)},
      {"1252 to 932", 1252, 932, "\xE9", u"", "?"},  // no e acute in 932: the default character
      {"narrow zero kept", 1252, 65001, std::string("a\0b", 3), u"", std::string("a\0b", 3)},
      {"wide to 1252", 1252, 1252, "", u"\u65E5\u00E9\u20AC", "?\xE9\x80"},
      {"wide zero kept", 1252, 932, "", std::u16string(u"a\0\u65E5", 3), std::string("a\0\x93\xFA", 4)},
      {"wide to UTF-16BE", 1252, 0x8000FDF4, "", u"\U0001F600\n", std::string("\xD8\x3D\xDE\x00\0\r\0\n", 8)},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    ProcessCodePages pinned(row.acp, 850);
    TempDir dir;
    VynSDK::Util::TextFile::Writer writer;
    ASSERT_TRUE(writer.Open(dir.File("t.txt").c_str(), false, row.encoding, LineEndCRLF));
    const std::size_t result = row.wide.empty() ? writer.Write(row.narrow.c_str(), row.narrow.size())
                                                : writer.Write(row.wide.c_str(), row.wide.size());
    EXPECT_EQ(result, row.file.size());
    EXPECT_EQ(writer.Position(), row.file.size());
    writer.Close();
    EXPECT_EQ(Hex(FileContents(dir.path() / "t.txt")), Hex(row.file));
  }
}
