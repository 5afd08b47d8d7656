// SearchPathW over real folders. Expected values follow the SearchPath page of the Win32
// documentation: the folders are searched in order, the extension is added only to a name
// without one, the result is the length without the terminator or, when the buffer is too small,
// the size needed with it; the paths come back in the backslash form of GetFullPathNameW.

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <string>

#include "support/temp_dir.h"
#include "win32/last_error.h"
#include "win32/search_path.h"

namespace {

using namespace win32;

std::u16string Backslashed(std::u16string path) {
  std::replace(path.begin(), path.end(), u'/', u'\\');
  return path;
}

}  // namespace

TEST(SearchPath, FindsTheFirstFolderThatHoldsTheFile) {
  vyn::test::TempDir dir;
  std::filesystem::create_directories(dir.path() / "a");
  std::filesystem::create_directories(dir.path() / "b");
  dir.Write("a/file.txt", "");
  dir.Write("b/file.txt", "");
  dir.Write("b/tool.exe", "");
  const std::u16string a = dir.File("a");
  const std::u16string b = dir.File("b");
  const struct {
    const char* what;
    std::u16string path;
    std::u16string name;
    const char16_t* extension;
    std::u16string found;  // empty: not found
  } rows[] = {
      {"first folder wins", a + u";" + b, u"file.txt", nullptr, a + u"/file.txt"},
      {"empty entries skipped", u";" + b + u";", u"file.txt", nullptr, b + u"/file.txt"},
      {"Windows-form folder", Backslashed(b) + u"\\", u"tool", u".exe", b + u"/tool.exe"},
      {"extension only without one", b, u"tool.exe", u".dll", b + u"/tool.exe"},
      {"a name with a root ignores the folders", a, b + u"/tool.exe", nullptr, b + u"/tool.exe"},
      {"absent", a + u";" + b, u"tool.dll", nullptr, u""},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    MCHAR buffer[512];
    LPWSTR filePart = buffer;
    SetLastError(0);
    const DWORD length = SearchPathW(row.path.c_str(), row.name.c_str(), row.extension, 512, buffer, &filePart);
    if (row.found.empty()) {
      EXPECT_EQ(length, 0u);
      EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND);
      EXPECT_EQ(filePart, nullptr);
      continue;
    }
    const std::u16string expected = Backslashed(row.found);
    EXPECT_EQ(std::u16string(buffer, length), expected);
    ASSERT_NE(filePart, nullptr);
    EXPECT_EQ(std::u16string(filePart), expected.substr(expected.rfind(u'\\') + 1));
  }
}

TEST(SearchPath, TooSmallBufferGetsTheSizeNeeded) {
  vyn::test::TempDir dir;
  const std::u16string expected = Backslashed(dir.Write("file.txt", ""));
  const DWORD length = static_cast<DWORD>(expected.size());
  std::u16string buffer(length + 1, u'#');
  LPWSTR filePart = buffer.data();
  EXPECT_EQ(SearchPathW(dir.File("").c_str(), u"file.txt", nullptr, length, buffer.data(), &filePart), length + 1);
  EXPECT_EQ(buffer, std::u16string(length + 1, u'#'));
  EXPECT_EQ(filePart, nullptr);
  EXPECT_EQ(SearchPathW(dir.File("").c_str(), u"file.txt", nullptr, length + 1, buffer.data(), &filePart), length);
  EXPECT_EQ(buffer.c_str(), expected);
  EXPECT_EQ(filePart, buffer.data() + length - 8);
}
