// Formatted output of text writers: every member of the Printf and Vprintf families, wide and
// narrow arguments, runtime locales, refused formats, and the same calls on a read-write file.

#include <gtest/gtest.h>

#include <cstdarg>
#include <string>

#include "files/text_writer_test_support.h"
#include "support/process_code_pages.h"
#include "support/temp_dir.h"
#include "win32/crt_format.h"

namespace {

using VynSDK::Util::TextFile::BaseTextWriter;
using VynSDK::Util::TextFile::LineEndCRLF;
using VynSDK::Util::TextFile::ReaderWriter;
using VynSDK::Util::TextFile::Writer;
using namespace vyn::test;

// The list forms, reached through variadic helpers; each list is passed twice, as the runtime's
// va_list may be used again.
std::size_t Twice(BaseTextWriter& w, int form, _locale_t locale, const void* format, ...) {
  va_list args;
  va_start(args, format);
  const auto* wide = static_cast<const MCHAR*>(format);
  const auto* narrow = static_cast<const char*>(format);
  std::size_t result = 0;
  for (int i = 0; i < 2; ++i) {
    switch (form) {
      case 0: result = w.Vprintf(wide, args); break;
      case 1: result = w.VprintfW(wide, args); break;
      case 2: result = w.VprintfA(narrow, args); break;
      case 3: result = w.Vprintf_l(wide, locale, args); break;
      case 4: result = w.VprintfW_l(wide, locale, args); break;
      default: result = w.VprintfA_l(narrow, locale, args); break;
    }
  }
  va_end(args);
  return result;
}

struct Locale {
  Locale() : value(win32::_create_locale(win32::LC_ALL_CRT, "German")) {}
  ~Locale() { win32::_free_locale(value); }
  _locale_t value;
};

}  // namespace

TEST(TextWriterPrintf, EveryFormWithWideAndNarrowArguments) {
  ProcessCodePages pinned(1252, 850);
  Locale german;  // decimal comma
  ASSERT_NE(german.value, nullptr);
  TempDir dir;
  Writer writer;
  ASSERT_TRUE(writer.Open(dir.File("t.txt").c_str(), false, 65001, LineEndCRLF));
  // Wide formats take wide text for %s and narrow text for %S; narrow formats the other way.
  // Each result is the bytes written (UTF-8, LF written as CR LF).
  EXPECT_EQ(writer.Printf(u"%d %s %S\n", 1, u"w\u00E9", "n\xE9"), 11u);
  EXPECT_EQ(writer.PrintfW(u"%hs|%ls|", "h", u"l"), 4u);
  EXPECT_EQ(writer.PrintfA("%s %S %.1f\n", "n\xE9", u"w\u00E9", 2.5), 13u);
  EXPECT_EQ(writer.Printf_l(u"%.2f ", german.value, 3.25), 5u);
  EXPECT_EQ(writer.PrintfW_l(u"%s %.1f ", german.value, u"x", 0.5), 6u);
  EXPECT_EQ(writer.PrintfA_l("%.1f\n", german.value, 1.5), 5u);
  EXPECT_EQ(writer.Printf(u"%05d|%-3s|%x\n", 42, u"a", 255u), 14u);
  for (int form = 0; form < 6; ++form) {
    const bool narrow = form == 2 || form == 5;
    const void* format = narrow ? static_cast<const void*>("<%d %.1f>")
                                : static_cast<const void*>(u"<%d %.1f>");
    EXPECT_EQ(Twice(writer, form, german.value, format, form, 0.5), 7u) << form;
  }
  EXPECT_EQ(writer.Printf(u"%3000d\n", 7), 3002u) << "longer than any fixed buffer";
  writer.Close();
  const std::string text = FileContents(dir.path() / "t.txt");
  EXPECT_EQ(text.substr(0, text.size() - 3002),
            "1 w\xC3\xA9 n\xC3\xA9\r\nh|l|n\xC3\xA9 w\xC3\xA9 2.5\r\n3,25 x 0,5 1,5\r\n"
            "00042|a  |ff\r\n"
            "<0 0.5><0 0.5><1 0.5><1 0.5><2 0.5><2 0.5><3 0,5><3 0,5><4 0,5><4 0,5><5 0,5><5 0,5>");
  EXPECT_EQ(text.substr(text.size() - 3002), std::string(2999, ' ') + "7\r\n");
}

TEST(TextWriterPrintf, RefusedFormatsWriteNothing) {
  TempDir dir;
  Writer writer;
  ASSERT_TRUE(writer.Open(dir.File("t.txt").c_str(), false, 65001, LineEndCRLF));
  const std::size_t failed = static_cast<std::size_t>(-1);
  EXPECT_EQ(writer.Printf(u"a%n", nullptr), failed);  // %n: the runtime's invalid format
  EXPECT_EQ(writer.PrintfA("b%k"), failed);          // an unknown conversion
  EXPECT_EQ(writer.LastErrorCode(), Writer::ErrorFormat);
  EXPECT_EQ(writer.Printf(nullptr), failed);
  EXPECT_EQ(writer.PrintfA("%s", "ok"), 2u);
  EXPECT_EQ(writer.LastErrorCode(), 0u);
  writer.Close();
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "ok");
}

TEST(TextWriterPrintf, ReadWriteFilesFormatToo) {
  TempDir dir;
  const std::u16string path = dir.Write("t.txt", "head\n");
  ReaderWriter file;
  ASSERT_TRUE(file.Open(path.c_str(), ReaderWriter::OpenAppend, 65001, LineEndCRLF));
  EXPECT_EQ(file.Printf(u"%s=%d\n", u"k\u00E9y", 12), 8u) << "code points stored, LF as CR LF";
  EXPECT_EQ(file.Printf(u"%n", nullptr), static_cast<std::size_t>(-1));
  file.Close();
  EXPECT_EQ(FileContents(dir.path() / "t.txt"), "head\r\nk\xC3\xA9y=12\r\n");
}
