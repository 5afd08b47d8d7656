// Full path names, the current folder, the temporary folder and temporary file names.

#include "win32/full_path.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>
#include <string>

#include "scoped_env.h"
#include "support/temp_dir.h"
#include "syscalls.h"
#include "win32/last_error.h"
#include "win32/temp_files.h"

namespace {

using namespace win32;
namespace fs = std::filesystem;

std::u16string FullPath(const std::u16string& name) {
  MCHAR buffer[512];
  const DWORD length = GetFullPathNameW(name.c_str(), 512, buffer, nullptr);
  return std::u16string(buffer, length);
}

std::u16string WindowsForm(const fs::path& path) {
  std::u16string text = path.u16string();
  for (char16_t& c : text) {
    if (c == u'/') c = u'\\';
  }
  return text;
}

}  // namespace

TEST(FullPath, FollowsWindowsRulesOnTheText) {
  // GetFullPathNameW documentation and "Naming Files, Paths, and Namespaces": separators become
  // '\', "." goes, ".." climbs but not above the root, the last name loses trailing dots and
  // spaces.
  const struct {
    const char16_t* name;
    const char16_t* full;
  } rows[] = {
      {u"C:\\a\\b\\..\\c", u"C:\\a\\c"},
      {u"C:/a//b/./c", u"C:\\a\\b\\c"},
      {u"C:\\..\\..", u"C:\\"},
      {u"C:\\a\\..", u"C:\\"},
      {u"C:\\a\\", u"C:\\a\\"},
      {u"C:\\a\\.\\", u"C:\\a\\"},
      {u"C:\\a\\file.txt. . ", u"C:\\a\\file.txt"},
      {u"C:rel\\x", u"C:\\rel\\x"},
      {u"\\\\srv\\share\\..\\..\\x", u"\\\\srv\\share\\x"},
      {u"\\\\srv\\share", u"\\\\srv\\share"},
      {u"\\\\srv\\share\\", u"\\\\srv\\share\\"},
      {u"\\a\\..\\..\\b", u"\\b"},
      {u"\\\\?\\C:\\a\\..\\b", u"\\\\?\\C:\\a\\..\\b"},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(testing::PrintToString(std::u16string(row.name)));
    EXPECT_EQ(FullPath(row.name), row.full);
  }
  // Relative names start from the current folder, written with backslashes.
  const std::u16string here = WindowsForm(fs::current_path());
  const std::u16string up = WindowsForm(fs::current_path().parent_path());
  EXPECT_EQ(FullPath(u"x\\y"), here + u"\\x\\y");
  EXPECT_EQ(FullPath(u"."), here);
  EXPECT_EQ(FullPath(u"..\\z"), (up == u"\\" ? u"" : up) + u"\\z");
}

TEST(FullPath, BufferSizesAndTheFilePart) {
  MCHAR buffer[32];
  std::fill(std::begin(buffer), std::end(buffer), u'#');
  MCHAR* part = buffer;
  // Too small: the size needed with the terminator, the buffer left alone.
  EXPECT_EQ(GetFullPathNameW(u"C:\\folder\\name.txt", 8, buffer, &part), 19u);
  EXPECT_EQ(buffer[0], u'#');
  EXPECT_EQ(GetFullPathNameW(u"C:\\folder\\name.txt", 19, buffer, &part), 18u);
  EXPECT_EQ(std::u16string(buffer), u"C:\\folder\\name.txt");
  ASSERT_NE(part, nullptr);
  EXPECT_EQ(std::u16string(part), u"name.txt");
  EXPECT_EQ(GetFullPathNameW(u"C:\\folder\\", 32, buffer, &part), 10u);
  EXPECT_EQ(part, nullptr) << "no file part after a final separator";
  EXPECT_EQ(GetFullPathNameW(u"", 32, buffer, &part), 0u);
  EXPECT_EQ(GetLastError(), ERROR_INVALID_NAME);

  const std::u16string here = WindowsForm(fs::current_path());
  EXPECT_EQ(GetCurrentDirectoryW(0, nullptr), here.size() + 1);
  std::u16string current(here.size() + 1, u'#');
  EXPECT_EQ(GetCurrentDirectoryW(static_cast<DWORD>(current.size()), current.data()), here.size());
  EXPECT_EQ(current.c_str(), here);
}

TEST(TempFiles, TempPathFollowsTmpdirWithAFinalSeparator) {
  const struct {
    const char* tmpdir;
    const char16_t* path;
  } rows[] = {{nullptr, u"\\tmp\\"}, {"", u"\\tmp\\"}, {"/var/tmp", u"\\var\\tmp\\"}, {"/srv/t/", u"\\srv\\t\\"}};
  for (const auto& row : rows) {
    SCOPED_TRACE(row.tmpdir != nullptr ? row.tmpdir : "(unset)");
    ScopedEnv tmpdir("TMPDIR", row.tmpdir);
    const std::u16string expected = row.path;
    MCHAR buffer[64];
    EXPECT_EQ(GetTempPathW(64, buffer), expected.size());
    EXPECT_EQ(std::u16string(buffer), expected);
    EXPECT_EQ(GetTempPathW(static_cast<DWORD>(expected.size()), buffer), expected.size() + 1);
  }
}

TEST(TempFiles, UniqueNamesAreCreatedOnce) {
  vyn::test::TempDir dir;
  const std::u16string folder = dir.File("");
  MCHAR first[MAX_PATH], second[MAX_PATH];
  const UINT one = GetTempFileNameW(folder.c_str(), u"vynutil", 0, first);
  const UINT two = GetTempFileNameW(folder.c_str(), u"vynutil", 0, second);
  ASSERT_NE(one, 0u);
  ASSERT_NE(two, 0u);
  EXPECT_NE(one, two);
  // GetTempFileNameW documentation: <path>\<first three of the prefix><hex number>.tmp.
  const std::string name = fs::path(std::u16string(first)).filename().string();
  const std::string hex = name.substr(3, name.size() - 7);
  EXPECT_TRUE(name.starts_with("vyn") && name.ends_with(".tmp") && !hex.empty() && hex.size() <= 4 &&
              hex.find_first_not_of("0123456789ABCDEF") == std::string::npos)
      << name;
  EXPECT_EQ(std::stoul(hex, nullptr, 16), one);
  EXPECT_TRUE(fs::is_regular_file(std::u16string(first)));
  EXPECT_EQ(fs::file_size(std::u16string(first)), 0u);
  EXPECT_TRUE(fs::is_regular_file(std::u16string(second)));

  // A given number names a file and creates nothing; only its low 16 bits count.
  MCHAR named[MAX_PATH];
  EXPECT_EQ(GetTempFileNameW(u"C:\\Temp", u"ab", 0x1A2B, named), 0x1A2Bu);
  EXPECT_EQ(std::u16string(named), u"C:\\Temp\\ab1A2B.tmp");
  EXPECT_EQ(GetTempFileNameW(u"C:\\Temp\\", nullptr, 0x12345, named), 0x12345u);
  EXPECT_EQ(std::u16string(named), u"C:\\Temp\\2345.tmp");

  EXPECT_EQ(GetTempFileNameW(dir.File("missing").c_str(), u"x", 0, named), 0u);
  EXPECT_EQ(GetLastError(), ERROR_DIRECTORY);
  EXPECT_EQ(GetTempFileNameW(std::u16string(MAX_PATH - 13, u'a').c_str(), u"x", 0, named), 0u);
  EXPECT_EQ(GetLastError(), ERROR_BUFFER_OVERFLOW);
  {
    sys::ScopedSyscalls calls;
    calls.table().open = [](const char*, int, mode_t) {
      errno = EEXIST;
      return -1;
    };
    EXPECT_EQ(GetTempFileNameW(folder.c_str(), u"x", 0, named), 0u);
    EXPECT_EQ(GetLastError(), ERROR_FILE_EXISTS) << "every one of the 65535 names is taken";
  }
}
