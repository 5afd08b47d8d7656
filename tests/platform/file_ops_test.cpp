// DeleteFileW, CopyFileW, MoveFileExW and the folder calls on real files: their Win32 error
// codes, and that a failure part-way loses nothing (injected through the system-call table).

#include "win32/file_ops.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cerrno>
#include <chrono>
#include <cstring>
#include <filesystem>
#include <string>

#include "file_test_helpers.h"
#include "support/temp_dir.h"
#include "syscalls.h"
#include "win32/folders.h"
#include "win32/last_error.h"
#include "win32/path_map.h"

namespace {

using namespace win32;
using vyn::test::Contents;
namespace fs = std::filesystem;
using vyn::test::MakeReadOnly;

std::size_t EntriesIn(const fs::path& folder) {
  return static_cast<std::size_t>(std::distance(fs::directory_iterator(folder), fs::directory_iterator()));
}

}  // namespace

TEST(FileOps, DeleteFileSaysWhatStandsInTheWay) {
  vyn::test::TempDir dir;
  dir.Write("file.txt", "x");
  dir.Write("locked.txt", "x");
  MakeReadOnly(dir.path() / "locked.txt");
  fs::create_directory(dir.path() / "folder");
  fs::create_symlink(dir.path() / "file.txt", dir.path() / "link");
  const struct {
    const char* name;
    DWORD error;  // 0: deleted
  } rows[] = {
      {"missing.txt", ERROR_FILE_NOT_FOUND},
      {"nofolder/missing.txt", ERROR_PATH_NOT_FOUND},
      {"folder", ERROR_ACCESS_DENIED},  // DeleteFile deletes no folder
      {"locked.txt", ERROR_ACCESS_DENIED},  // nor a read-only file
      {"link", 0},  // the link itself goes
      {"file.txt", 0},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    SetLastError(0);
    EXPECT_EQ(DeleteFileW(dir.File(row.name).c_str()), row.error == 0);
    EXPECT_EQ(GetLastError(), row.error);
  }
  EXPECT_TRUE(fs::exists(dir.path() / "locked.txt"));
  EXPECT_TRUE(fs::exists(dir.path() / "folder"));
  EXPECT_FALSE(fs::exists(dir.path() / "file.txt"));
}

TEST(FileOps, CopyFileCopiesDataPermissionsAndWriteTime) {
  vyn::test::TempDir dir;
  const std::string data(3 << 20, 'q');  // more than one copy block
  const std::u16string source = dir.Write("source.bin", data);
  MakeReadOnly(dir.path() / "source.bin");
  const auto written = fs::file_time_type(std::chrono::seconds(1000000000));
  fs::last_write_time(dir.path() / "source.bin", written);
  ASSERT_TRUE(CopyFileW(source.c_str(), dir.File("copy.bin").c_str(), TRUE));
  EXPECT_EQ(Contents(dir.path() / "copy.bin"), data);
  EXPECT_EQ(fs::status(dir.path() / "copy.bin").permissions(),
            fs::status(dir.path() / "source.bin").permissions());
  EXPECT_EQ(fs::last_write_time(dir.path() / "copy.bin"), written);

  dir.Write("old.txt", "old");
  fs::create_directory(dir.path() / "folder");
  const struct {
    const char* what;
    std::u16string from;
    const char* to;
    BOOL failIfExists;
    DWORD error;
  } rows[] = {
      {"an existing target with failIfExists", source, "old.txt", TRUE, ERROR_FILE_EXISTS},
      {"a read-only target", dir.File("old.txt"), "copy.bin", FALSE, ERROR_ACCESS_DENIED},
      {"a folder as target", source, "folder", FALSE, ERROR_ACCESS_DENIED},
      {"a folder as source", dir.File("folder"), "new.txt", FALSE, ERROR_ACCESS_DENIED},
      {"a missing source", dir.File("missing"), "new.txt", FALSE, ERROR_FILE_NOT_FOUND},
      {"a missing target folder", source, "none/new.txt", FALSE, ERROR_PATH_NOT_FOUND},
      {"the source itself", source, "source.bin", FALSE, ERROR_SHARING_VIOLATION},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    SetLastError(0);
    EXPECT_FALSE(CopyFileW(row.from.c_str(), dir.File(row.to).c_str(), row.failIfExists));
    EXPECT_EQ(GetLastError(), row.error);
  }
  EXPECT_EQ(Contents(dir.path() / "old.txt"), "old");
  EXPECT_EQ(Contents(dir.path() / "source.bin"), data) << "copying onto itself cut nothing";
  dir.Write("new.txt", "replaced");
  ASSERT_TRUE(CopyFileW(dir.File("old.txt").c_str(), dir.File("new.txt").c_str(), FALSE));
  EXPECT_EQ(Contents(dir.path() / "new.txt"), "old") << "without failIfExists the target is replaced";
}

namespace {
int g_writes;
ssize_t FailSecondWrite(int fd, const void* data, size_t bytes) {
  if (++g_writes == 2) {
    errno = ENOSPC;
    return -1;
  }
  return win32::sys::DefaultSyscalls().write(fd, data, bytes);
}
}  // namespace

TEST(FileOps, CopyThatFailsPartWayLeavesNoTarget) {
  vyn::test::TempDir dir;
  const std::u16string source = dir.Write("big.bin", std::string(3 << 20, 'b'));
  dir.Write("old.txt", "old");
  sys::ScopedSyscalls calls;
  calls.table().write = FailSecondWrite;
  for (const char* target : {"new.bin", "old.txt"}) {
    SCOPED_TRACE(target);
    g_writes = 0;
    EXPECT_FALSE(CopyFileW(source.c_str(), dir.File(target).c_str(), FALSE));
    EXPECT_EQ(GetLastError(), ERROR_DISK_FULL);
    EXPECT_FALSE(fs::exists(dir.path() / target)) << "no half copy is left";
  }
}

TEST(FileOps, MoveFileExReplacesOnlyWhenAsked) {
  vyn::test::TempDir dir;
  const auto reset = [&] {
    fs::remove_all(dir.path());
    fs::create_directories(dir.path() / "folder");
    dir.Write("a.txt", "a");
    dir.Write("b.txt", "b");
    dir.Write("locked.txt", "l");
    MakeReadOnly(dir.path() / "locked.txt");
    fs::create_directory(dir.path() / "emptyfolder");
  };
  const struct {
    const char* what;
    const char* from;
    const char* to;
    DWORD flags;
    DWORD error;  // 0: moved
  } rows[] = {
      {"a rename", "a.txt", "c.txt", 0, 0},
      {"onto a file without replacing", "a.txt", "b.txt", 0, ERROR_ALREADY_EXISTS},
      {"onto a file, replacing", "a.txt", "b.txt", MOVEFILE_REPLACE_EXISTING, 0},
      {"onto a read-only file", "a.txt", "locked.txt", MOVEFILE_REPLACE_EXISTING, ERROR_ACCESS_DENIED},
      {"onto a folder", "a.txt", "folder", MOVEFILE_REPLACE_EXISTING, ERROR_ACCESS_DENIED},
      {"a folder onto a file", "folder", "b.txt", MOVEFILE_REPLACE_EXISTING, ERROR_ACCESS_DENIED},
      {"a folder, renamed", "folder", "renamed", MOVEFILE_WRITE_THROUGH, 0},
      {"a folder onto an empty folder", "folder", "emptyfolder", 0, ERROR_ALREADY_EXISTS},
      {"into a missing folder", "a.txt", "none/a.txt", 0, ERROR_PATH_NOT_FOUND},
      {"a missing source", "none.txt", "x.txt", 0, ERROR_FILE_NOT_FOUND},
      {"a read-only source", "locked.txt", "moved.txt", 0, 0},
      {"an unsupported flag", "a.txt", "c.txt", 0x4, ERROR_INVALID_PARAMETER},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    reset();
    const std::string before = fs::exists(dir.path() / row.from) && fs::is_regular_file(dir.path() / row.from)
                                   ? Contents(dir.path() / row.from) : "";
    SetLastError(0);
    EXPECT_EQ(MoveFileExW(dir.File(row.from).c_str(), dir.File(row.to).c_str(), row.flags), row.error == 0);
    EXPECT_EQ(GetLastError(), row.error);
    if (row.error == 0) {
      EXPECT_FALSE(fs::exists(dir.path() / row.from));
      if (!before.empty()) {
        EXPECT_EQ(Contents(dir.path() / row.to), before);
      }
    } else if (row.error != ERROR_FILE_NOT_FOUND) {
      EXPECT_TRUE(fs::exists(dir.path() / row.from)) << "a failed move keeps the source";
    }
  }
  EXPECT_FALSE(MoveFileExW(dir.File("a.txt").c_str(), nullptr, 0));
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
}

namespace {
// rename as if the target were on another file system, except for the library's own temporary
// copy beside the target, which is on the target's.
int CrossDevice(const char* from, const char* to) {
  if (std::strstr(from, ".vyn-move-") != nullptr) return win32::sys::DefaultSyscalls().rename(from, to);
  errno = EXDEV;
  return -1;
}
int CrossDeviceNoReplace(const char* from, const char* to) {
  if (std::strstr(from, ".vyn-move-") != nullptr) {
    return win32::sys::DefaultSyscalls().renameNoReplace(from, to);
  }
  errno = EXDEV;
  return -1;
}
}  // namespace

TEST(FileOps, MovesAcrossFileSystemsCopyOnlyWhenAllowed) {
  vyn::test::TempDir dir;
  sys::ScopedSyscalls calls;
  calls.table().rename = CrossDevice;
  calls.table().renameNoReplace = CrossDeviceNoReplace;
  const std::u16string source = dir.Write("from.txt", "payload");
  fs::permissions(dir.path() / "from.txt", fs::perms(0640));
  dir.Write("to.txt", "previous");

  EXPECT_FALSE(MoveFileExW(source.c_str(), dir.File("to.txt").c_str(), MOVEFILE_REPLACE_EXISTING));
  EXPECT_EQ(GetLastError(), ERROR_NOT_SAME_DEVICE);
  fs::create_directory(dir.path() / "sub");
  EXPECT_FALSE(MoveFileExW(dir.File("sub").c_str(), dir.File("sub2").c_str(), MOVEFILE_COPY_ALLOWED));
  EXPECT_EQ(GetLastError(), ERROR_NOT_SAME_DEVICE) << "folders are never copied";

  // A copy that fails keeps both the source and the old target, and leaves no temporary file.
  g_writes = 0;
  calls.table().write = FailSecondWrite;
  const std::u16string big = dir.Write("big.txt", std::string(3 << 20, 'x'));
  const std::size_t entries = EntriesIn(dir.path());
  EXPECT_FALSE(MoveFileExW(big.c_str(), dir.File("to.txt").c_str(),
                           MOVEFILE_REPLACE_EXISTING | MOVEFILE_COPY_ALLOWED));
  EXPECT_EQ(GetLastError(), ERROR_DISK_FULL);
  EXPECT_EQ(Contents(dir.path() / "to.txt"), "previous");
  EXPECT_TRUE(fs::exists(dir.path() / "big.txt"));
  EXPECT_EQ(EntriesIn(dir.path()), entries);
  calls.table().write = sys::DefaultSyscalls().write;

  EXPECT_FALSE(MoveFileExW(source.c_str(), dir.File("to.txt").c_str(), MOVEFILE_COPY_ALLOWED));
  EXPECT_EQ(GetLastError(), ERROR_ALREADY_EXISTS);
  ASSERT_TRUE(MoveFileExW(source.c_str(), dir.File("to.txt").c_str(),
                          MOVEFILE_REPLACE_EXISTING | MOVEFILE_COPY_ALLOWED | MOVEFILE_WRITE_THROUGH));
  EXPECT_EQ(Contents(dir.path() / "to.txt"), "payload");
  EXPECT_EQ(fs::status(dir.path() / "to.txt").permissions(), fs::perms(0640));
  EXPECT_FALSE(fs::exists(dir.path() / "from.txt"));
  EXPECT_EQ(EntriesIn(dir.path()), entries - 1);
}

TEST(Folders, CreateAndRemoveOneFolder) {
  vyn::test::TempDir dir;
  dir.Write("file.txt", "x");
  ASSERT_TRUE(CreateDirectoryW(dir.File("new").c_str(), nullptr));
  EXPECT_TRUE(fs::is_directory(dir.path() / "new"));
  dir.Write("new/inside.txt", "x");
  const struct {
    const char* what;
    bool create;  // CreateDirectoryW, else RemoveDirectoryW
    const char* name;
    DWORD error;
  } rows[] = {
      {"create an existing folder", true, "new", ERROR_ALREADY_EXISTS},
      {"create over a file", true, "file.txt", ERROR_ALREADY_EXISTS},
      {"create in a missing folder", true, "a/b", ERROR_PATH_NOT_FOUND},
      {"remove a full folder", false, "new", ERROR_DIR_NOT_EMPTY},
      {"remove a file", false, "file.txt", ERROR_DIRECTORY},
      {"remove a missing folder", false, "gone", ERROR_FILE_NOT_FOUND},
      {"remove below a missing folder", false, "gone/deeper", ERROR_PATH_NOT_FOUND},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    SetLastError(0);
    const std::u16string path = dir.File(row.name);
    EXPECT_FALSE(row.create ? CreateDirectoryW(path.c_str(), nullptr) : RemoveDirectoryW(path.c_str()));
    EXPECT_EQ(GetLastError(), row.error);
  }
  fs::remove(dir.path() / "new/inside.txt");
  EXPECT_TRUE(RemoveDirectoryW(dir.File("new").c_str()));
  EXPECT_FALSE(fs::exists(dir.path() / "new"));
}

TEST(Folders, ShellCreatesEveryMissingFolder) {
  vyn::test::TempDir dir;
  dir.Write("file.txt", "x");
  win32::SetDriveRoot(u'T', dir.path().c_str());
  win32::SetDriveRoot(u'U', (dir.path() / "no-such-root").c_str());
  // SHCreateDirectoryExW documentation: its return codes.
  const struct {
    const char16_t* path;
    int result;
  } rows[] = {
      {u"T:\\a\\b\\c", ERROR_SUCCESS},
      {u"T:\\a\\b\\c", ERROR_ALREADY_EXISTS},
      {u"T:\\a\\b\\c\\", ERROR_ALREADY_EXISTS},
      {u"T:/a/b2//c2", ERROR_SUCCESS},
      {u"T:\\file.txt", ERROR_FILE_EXISTS},
      {u"T:\\file.txt\\sub", ERROR_PATH_NOT_FOUND},
      {u"U:\\x", ERROR_PATH_NOT_FOUND},  // a missing drive root is not created
      {u"relative\\x", ERROR_BAD_PATHNAME},
      {u"T:\\", ERROR_ALREADY_EXISTS},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(testing::PrintToString(std::u16string(row.path)));
    SetLastError(12345);
    EXPECT_EQ(SHCreateDirectoryExW(nullptr, row.path, nullptr), row.result);
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(row.result));
  }
  win32::SetDriveRoot(u'T', nullptr);
  win32::SetDriveRoot(u'U', nullptr);
  EXPECT_TRUE(fs::is_directory(dir.path() / "a/b/c"));
  EXPECT_TRUE(fs::is_directory(dir.path() / "a/b2/c2"));
  EXPECT_FALSE(fs::exists(dir.path() / "no-such-root"));
  EXPECT_EQ(SHCreateDirectoryExW(nullptr, dir.File("posix/path").c_str(), nullptr), ERROR_SUCCESS)
      << "a POSIX absolute path is accepted";
  EXPECT_EQ(SHCreateDirectoryExW(nullptr, (u"C:\\" + std::u16string(250, u'x')).c_str(), nullptr),
            ERROR_FILENAME_EXCED_RANGE);
  EXPECT_EQ(SHCreateDirectoryExW(nullptr, nullptr, nullptr), ERROR_BAD_PATHNAME);
}
