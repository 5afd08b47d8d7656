// Opening and closing: paths, runtime files and Win32 handles, the last-error codes, and what
// every operation does with no source open.

#include <gtest/gtest.h>

#include <cstdio>
#include <functional>
#include <string>

#include "files/text_reader_test_support.h"
#include "win32/file_handle.h"
#include "win32/handles.h"

namespace {

using namespace vyn::test::text;
using VynSDK::Util::TextFile::LineEndCRLF;
using VynSDK::Util::TextFile::LineEndLF;
using VynSDK::Util::TextFile::LineEndNone;

TEST(TextReaderOpen, NothingOpen) {
  TestReader r;
  EXPECT_TRUE(r.IsEndOfFile());
  const struct {
    const char* name;
    std::function<bool(TestReader&)> call;
  } calls[] = {
      {"ReadCharUTF32", [](TestReader& t) { return t.ReadCharUTF32() == 0xFFFFFFFF; }},
      {"ReadChar", [](TestReader& t) { return t.ReadChar().IsNull(); }},
      {"ReadChars", [](TestReader& t) { return t.ReadChars(3).IsNull(); }},
      {"ReadLine", [](TestReader& t) { return t.ReadLine().IsNull(); }},
      {"ReadChunk", [](TestReader& t) { return t.ReadChunk(3).IsNull(); }},
      {"ReadFull", [](TestReader& t) { return t.ReadFull().IsNull(); }},
      {"Seek", [](TestReader& t) { return t.Seek(3, 0) == 0; }},
  };
  for (const auto& c : calls) {
    SCOPED_TRACE(c.name);
    r.LastError();
    EXPECT_TRUE(c.call(r));
    EXPECT_EQ(r.LastErrorCode(), Reader::ErrorNotOpen);
  }
  EXPECT_EQ(r.Unread(VynSDK::Util::VynString::FromUTF16(u"x")), 0u);
  EXPECT_TRUE(r.LastError().IsNull()) << "no source, no text";
  EXPECT_EQ(r.LastErrorCode(), 0u);
  EXPECT_EQ(r.NumberOfChars(), 0u);
  EXPECT_EQ(r.LineNumber(), 0u);
}

TEST(TextReaderOpen, FailuresAndASecondOpen) {
  vyn::test::TempDir dir;
  Reader r;
  EXPECT_FALSE(r.Open(dir.File("missing.txt").c_str()));
  EXPECT_FALSE(r.Open(static_cast<const MCHAR*>(nullptr)));
  EXPECT_FALSE(r.Open(static_cast<FILE*>(nullptr)));
  EXPECT_FALSE(r.Open(static_cast<void*>(nullptr)));
  EXPECT_FALSE(r.IsFileOpen());

  TestReader stream;
  EXPECT_FALSE(stream.Open(nullptr, 0, LineEndCRLF, false));
  EXPECT_EQ(stream.LastErrorCode(), Reader::ErrorNullStream);

  r.SetReadBufferSize(0);  // taken as the smallest read there is
  ASSERT_TRUE(r.Open(dir.Write("first.txt", "first\n").c_str(), 1252, LineEndLF));
  EXPECT_EQ(r.Mode(), LineEndLF);
  EXPECT_FALSE(r.Open(dir.Write("second.txt", "second\n").c_str()));
  EXPECT_EQ(r.LastErrorCode(), Reader::ErrorAlreadyOpen);
  EXPECT_TRUE(r.IsFileOpen()) << "the first file stays open";
  EXPECT_EQ(Text(r.ReadLine()), u"first\n");
  r.Close();
  EXPECT_FALSE(r.IsFileOpen());
  EXPECT_EQ(r.NumberOfChars(), 6u) << "the buffer stays until the next Open";
  ASSERT_TRUE(r.Open(dir.File("second.txt").c_str(), 1252, LineEndNone));
  EXPECT_EQ(Text(r.ReadLine()), u"second\n");
  EXPECT_EQ(r.LastErrorCode(), 0u);
}

TEST(TextReaderOpen, CallersFileStaysOpen) {
  vyn::test::TempDir dir;
  dir.Write("f.txt", "skip\xC3\xA9t\xC3\xA9\n");
  FILE* file = std::fopen(dir.path().string().append("/f.txt").c_str(), "rb");
  ASSERT_NE(file, nullptr);
  ASSERT_EQ(std::fseek(file, 4, SEEK_SET), 0);
  {
    Reader r;
    ASSERT_TRUE(r.Open(file, 1252, LineEndNone));
    EXPECT_EQ(r.Encoding(), 65001u) << "detected from where the file stands";
    EXPECT_EQ(Text(r.ReadFull()), u"\u00e9t\u00e9\n");
    EXPECT_EQ(r.Seek(1, 0), 1u) << "back to the start of the text, not of the file";
    EXPECT_EQ(Text(r.ReadFull()), u"t\u00e9\n");
  }
  EXPECT_EQ(std::fseek(file, 0, SEEK_SET), 0) << "the file is still open";
  EXPECT_EQ(std::fgetc(file), 's');
  EXPECT_EQ(std::fclose(file), 0);

  const std::u16string path = dir.File("f.txt");
  HANDLE handle = win32::CreateFileW(path.c_str(), win32::GENERIC_READ,
                                     win32::FILE_SHARE_READ, nullptr, win32::OPEN_EXISTING, 0, nullptr);
  ASSERT_NE(handle, INVALID_HANDLE_VALUE);
  {
    Reader r;
    ASSERT_TRUE(r.Open(static_cast<void*>(handle), 1252, LineEndCRLF));
    EXPECT_EQ(Text(r.ReadFull()), u"skip\u00e9t\u00e9\r\n");
  }
  EXPECT_TRUE(win32::CloseHandle(handle)) << "the handle was left open";
}

}  // namespace
