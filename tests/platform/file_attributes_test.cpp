// File attributes of POSIX files as Windows reports them, the overrides for attributes POSIX
// lacks (as cloud storage sets them), and listing folders with FindFirstFileW masks.

#include "win32/file_attributes.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <string>
#include <vector>

#include "file_test_helpers.h"
#include "support/temp_dir.h"
#include "win32/find_file.h"
#include "win32/last_error.h"
#include "win32/path_map.h"

using namespace win32;
namespace fs = std::filesystem;
using vyn::test::MakeReadOnly;

TEST(FileAttributes, PosixEntriesReportWindowsAttributes) {
  vyn::test::TempDir dir;
  dir.Write("plain.txt", "x");
  dir.Write("locked.txt", "x");
  MakeReadOnly(dir.path() / "locked.txt");
  dir.Write(".hidden", "x");
  fs::create_directory(dir.path() / "folder");
  fs::create_directory(dir.path() / ".config");
  fs::create_symlink(dir.path() / "plain.txt", dir.path() / "filelink");
  fs::create_symlink(dir.path() / "folder", dir.path() / "folderlink");
  fs::create_symlink(dir.path() / "gone", dir.path() / "dangling");
  const struct {
    const char* name;
    DWORD attributes;
  } rows[] = {
      {"plain.txt", FILE_ATTRIBUTE_NORMAL},
      {"locked.txt", FILE_ATTRIBUTE_READONLY},
      {".hidden", FILE_ATTRIBUTE_HIDDEN},
      {"folder", FILE_ATTRIBUTE_DIRECTORY},
      {"folder/", FILE_ATTRIBUTE_DIRECTORY},
      {".config", FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_HIDDEN},
      {"filelink", FILE_ATTRIBUTE_REPARSE_POINT},
      {"folderlink", FILE_ATTRIBUTE_REPARSE_POINT | FILE_ATTRIBUTE_DIRECTORY},
      {"dangling", FILE_ATTRIBUTE_REPARSE_POINT},
      {"folder/.", FILE_ATTRIBUTE_DIRECTORY},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(GetFileAttributesW(dir.File(row.name).c_str()), row.attributes);
    EXPECT_TRUE(PathFileExistsW(dir.File(row.name).c_str()));
  }
  const struct {
    const char* name;
    DWORD error;
  } missing[] = {{"none.txt", ERROR_FILE_NOT_FOUND},
                 {"none/x.txt", ERROR_PATH_NOT_FOUND},
                 {"plain.txt/x", ERROR_PATH_NOT_FOUND}};
  for (const auto& row : missing) {
    SCOPED_TRACE(row.name);
    EXPECT_EQ(GetFileAttributesW(dir.File(row.name).c_str()), INVALID_FILE_ATTRIBUTES);
    EXPECT_EQ(GetLastError(), row.error);
    EXPECT_FALSE(PathFileExistsW(dir.File(row.name).c_str()));
  }
  EXPECT_EQ(GetFileAttributesW(u""), INVALID_FILE_ATTRIBUTES);
  EXPECT_EQ(GetLastError(), ERROR_PATH_NOT_FOUND);
  // A Windows path through a drive root.
  SetDriveRoot(u'T', dir.path().c_str());
  EXPECT_EQ(GetFileAttributesW(u"t:\\folder"), FILE_ATTRIBUTE_DIRECTORY);
  SetDriveRoot(u'T', nullptr);
}

TEST(FileAttributes, ExtendedDataHasSizeAndFileTimes) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("big.bin", "");
  fs::resize_file(dir.path() / "big.bin", (LONGLONG{1} << 32) + 5);  // sparse
  // 2000-01-01 00:00:00 UTC: 946684800 s after 1970, so (946684800 + 11644473600) * 10^7
  // intervals of 100 ns after 1601 (FILETIME documentation).
  const timespec times[2] = {{946684800, 0}, {946684800, 1234500}};
  ASSERT_EQ(utimensat(AT_FDCWD, (dir.path() / "big.bin").c_str(), times, 0), 0);
  WIN32_FILE_ATTRIBUTE_DATA data{};
  ASSERT_TRUE(GetFileAttributesExW(path.c_str(), GetFileExInfoStandard, &data));
  EXPECT_EQ(data.dwFileAttributes, FILE_ATTRIBUTE_NORMAL);
  EXPECT_EQ(data.nFileSizeHigh, 1u);
  EXPECT_EQ(data.nFileSizeLow, 5u);
  const auto ticks = [](const FILETIME& t) { return (ULONGLONG{t.dwHighDateTime} << 32) | t.dwLowDateTime; };
  EXPECT_EQ(ticks(data.ftLastAccessTime), 125911584000000000ull);
  EXPECT_EQ(ticks(data.ftLastWriteTime), 125911584000012345ull);
  EXPECT_GE(ticks(data.ftCreationTime), ticks(data.ftLastWriteTime));

  ASSERT_TRUE(GetFileAttributesExW(dir.File("").c_str(), GetFileExInfoStandard, &data));
  EXPECT_EQ(data.dwFileAttributes, FILE_ATTRIBUTE_DIRECTORY);
  EXPECT_EQ(data.nFileSizeLow, 0u) << "folders have no size";
  EXPECT_FALSE(GetFileAttributesExW(path.c_str(), GetFileExMaxInfoLevel, &data));
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
  EXPECT_FALSE(GetFileAttributesExW(dir.File("none").c_str(), GetFileExInfoStandard, &data));
  EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND);
}

TEST(FileAttributes, OverridesAddWhatPosixFilesLack) {
  vyn::test::TempDir dir;
  const std::u16string file = dir.Write("cloud.txt", "x");
  fs::create_directory(dir.path() / "MyDropboxFiles");
  constexpr DWORD kOnlineOnly = FILE_ATTRIBUTE_OFFLINE | FILE_ATTRIBUTE_ARCHIVE;
  detail::SetExtraFileAttributes(file.c_str(), kOnlineOnly);
  EXPECT_EQ(GetFileAttributesW(file.c_str()), kOnlineOnly) << "no NORMAL beside other bits";
  // The override belongs to the path however it is spelt.
  const std::u16string respelt = dir.File("") + u"/./MyDropboxFiles/..//cloud.txt";
  EXPECT_EQ(GetFileAttributesW(respelt.c_str()), kOnlineOnly);
  detail::SetExtraFileAttributes(dir.File("MyDropboxFiles/").c_str(), FILE_ATTRIBUTE_RECALL_ON_DATA_ACCESS);
  MakeReadOnly(dir.path() / "MyDropboxFiles");
  EXPECT_EQ(GetFileAttributesW(dir.File("MyDropboxFiles").c_str()),
            FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_RECALL_ON_DATA_ACCESS);
  detail::SetExtraFileAttributes(file.c_str(), FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT);
  EXPECT_EQ(GetFileAttributesW(file.c_str()), FILE_ATTRIBUTE_REPARSE_POINT) << "never a false folder";
  detail::SetExtraFileAttributes(file.c_str(), 0);
  EXPECT_EQ(GetFileAttributesW(file.c_str()), FILE_ATTRIBUTE_NORMAL);
  detail::ClearExtraFileAttributes();
  EXPECT_EQ(GetFileAttributesW(dir.File("MyDropboxFiles").c_str()),
            FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_READONLY);

  // The same attributes from the file's extended attribute, where the file system keeps them.
  if (setxattr((dir.path() / "cloud.txt").c_str(), "user.vyn.attributes", "0x1020", 6, 0) == 0) {
    EXPECT_EQ(GetFileAttributesW(file.c_str()), kOnlineOnly);
    detail::SetExtraFileAttributes(file.c_str(), FILE_ATTRIBUTE_ARCHIVE);
    EXPECT_EQ(GetFileAttributesW(file.c_str()), FILE_ATTRIBUTE_ARCHIVE) << "the override wins";
    detail::ClearExtraFileAttributes();
  }
}

TEST(FileAttributes, SetFileAttributesChangesPermissionsAndOverrides) {
  vyn::test::TempDir dir;
  const std::u16string file = dir.Write("doc.txt", "x");
  ASSERT_TRUE(SetFileAttributesW(file.c_str(), FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_ARCHIVE));
  EXPECT_EQ(GetFileAttributesW(file.c_str()), FILE_ATTRIBUTE_READONLY | FILE_ATTRIBUTE_ARCHIVE);
  EXPECT_EQ(fs::status(dir.path() / "doc.txt").permissions() &
                (fs::perms::owner_write | fs::perms::group_write | fs::perms::others_write),
            fs::perms::none);
  ASSERT_TRUE(SetFileAttributesW(file.c_str(), FILE_ATTRIBUTE_NORMAL));
  EXPECT_EQ(GetFileAttributesW(file.c_str()), FILE_ATTRIBUTE_NORMAL);
  EXPECT_NE(fs::status(dir.path() / "doc.txt").permissions() & fs::perms::owner_write, fs::perms::none);
  EXPECT_FALSE(SetFileAttributesW(dir.File("none").c_str(), FILE_ATTRIBUTE_NORMAL));
  EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND);
  detail::ClearExtraFileAttributes();
}

namespace {

std::vector<std::string> Find(const std::u16string& pattern, DWORD* error) {
  std::vector<std::string> names;
  WIN32_FIND_DATAW data;
  HANDLE search = FindFirstFileW(pattern.c_str(), &data);
  if (search == INVALID_HANDLE_VALUE) {
    *error = GetLastError();
    return names;
  }
  do {
    names.push_back(fs::path(std::u16string(data.cFileName)).string());
  } while (FindNextFileW(search, &data));
  *error = GetLastError();
  EXPECT_TRUE(FindClose(search));
  return names;
}

using Names = std::vector<std::string>;

}  // namespace

TEST(FindFile, MasksMatchAsWindowsMatchesThem) {
  vyn::test::TempDir dir;
  for (const char* name : {"a.txt", "B.TXT", "readme", "notes.md", "a.b.c", "x1.txt", "x12.txt", ".hidden"}) {
    dir.Write(name, "12345");
  }
  fs::create_directory(dir.path() / "sub");
  // FindFirstFileW documentation and the command prompt's "dir": '*' and '?' without regard to
  // case, "*.*" for everything, "." and ".." listed first in every folder but a root.
  const struct {
    const char16_t* mask;
    Names names;
  } rows[] = {
      {u"*", {".", "..", ".hidden", "a.b.c", "a.txt", "B.TXT", "notes.md", "readme", "sub", "x1.txt", "x12.txt"}},
      {u"*.*", {".", "..", ".hidden", "a.b.c", "a.txt", "B.TXT", "notes.md", "readme", "sub", "x1.txt", "x12.txt"}},
      {u"*.TXT", {"a.txt", "B.TXT", "x1.txt", "x12.txt"}},
      {u"x?.txt", {"x1.txt"}},
      {u"X??.tXt", {"x12.txt"}},
      {u"*.", {".", "..", "readme", "sub"}},
      {u"readme.*", {"readme"}},
      {u"a.*", {"a.b.c", "a.txt"}},
      {u"b.txt", {"B.TXT"}},
      {u"*e*", {".hidden", "notes.md", "readme"}},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(testing::PrintToString(std::u16string(row.mask)));
    DWORD error = 0;
    EXPECT_EQ(Find(dir.File("") + row.mask, &error), row.names);
    EXPECT_EQ(error, ERROR_NO_MORE_FILES);
  }
  const struct {
    std::u16string pattern;
    DWORD error;
  } failures[] = {
      {dir.File("nothing*"), ERROR_FILE_NOT_FOUND},
      {dir.File("none/*"), ERROR_PATH_NOT_FOUND},
      {dir.File("a.txt/*"), ERROR_PATH_NOT_FOUND},
      {dir.File("sub/"), ERROR_FILE_NOT_FOUND},
  };
  for (const auto& row : failures) {
    SCOPED_TRACE(testing::PrintToString(row.pattern));
    DWORD error = 0;
    EXPECT_TRUE(Find(row.pattern, &error).empty());
    EXPECT_EQ(error, row.error);
  }
}

TEST(FindFile, EntriesCarryTheirAttributesAndSize) {
  vyn::test::TempDir dir;
  dir.Write("data.bin", "12345");
  fs::create_directory(dir.path() / "sub");
  SetDriveRoot(u'T', dir.path().c_str());
  WIN32_FIND_DATAW data;
  HANDLE search = FindFirstFileW(u"T:\\*", &data);
  SetDriveRoot(u'T', nullptr);
  ASSERT_NE(search, INVALID_HANDLE_VALUE);
  std::vector<std::pair<std::u16string, DWORD>> seen;
  do {
    seen.emplace_back(data.cFileName, data.dwFileAttributes);
    if (std::u16string(data.cFileName) == u"data.bin") {
      EXPECT_EQ(data.nFileSizeLow, 5u);
    }
    EXPECT_EQ(data.cAlternateFileName[0], 0);
  } while (FindNextFileW(search, &data));
  EXPECT_FALSE(FindNextFileW(search, &data)) << "the end stays the end";
  EXPECT_EQ(GetLastError(), ERROR_NO_MORE_FILES);
  EXPECT_TRUE(FindClose(search));
  EXPECT_FALSE(FindClose(search));
  EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
  // "T:\" is a drive root: no "." and "..".
  const std::vector<std::pair<std::u16string, DWORD>> expected = {
      {u"data.bin", FILE_ATTRIBUTE_NORMAL}, {u"sub", FILE_ATTRIBUTE_DIRECTORY}};
  EXPECT_EQ(seen, expected);
}

TEST(FindFile, ManyStarsTakeLinearTime) {
  vyn::test::TempDir dir;
  dir.Write(std::string(200, 'a'), "");
  const auto start = std::chrono::steady_clock::now();
  DWORD error = 0;
  EXPECT_TRUE(Find(dir.File("*a*a*a*a*a*a*a*a*a*a*a*a*a*a*a*a*a*a*a*a*b"), &error).empty());
  EXPECT_EQ(error, ERROR_FILE_NOT_FOUND);
  EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(1));
}
