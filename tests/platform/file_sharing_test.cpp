// Share modes between open handles, in this process and across processes: the Win32 rule is
// that an open fails when it asks for a right an open handle does not share, or denies a right
// an open handle holds.

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <string>

#include "file_test_helpers.h"
#include "support/child_process.h"
#include "support/temp_dir.h"
#include "win32/file_handle.h"
#include "win32/file_ops.h"
#include "win32/last_error.h"

namespace {

using namespace win32;
using vyn::test::OpenFile;
using vyn::test::ScopedHandle;
namespace fs = std::filesystem;

constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;

struct Open {
  DWORD access;
  DWORD share;
};

struct Row {
  const char* what;
  Open first;
  Open second;
  bool secondOpens;
};

// "Creating and Opening Files" (Win32 documentation): the share mode of the first open decides
// what the second may ask for, and the second's share mode must allow what the first holds.
const Row kRows[] = {
    {"two readers sharing reading", {GENERIC_READ, FILE_SHARE_READ}, {GENERIC_READ, FILE_SHARE_READ}, true},
    {"a writer after a reader that shares only reading", {GENERIC_READ, FILE_SHARE_READ},
     {GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE}, false},
    {"a writer after a reader that shares writing", {GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE},
     {GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE}, true},
    {"a reader that denies writing after a writer", {GENERIC_WRITE, kShareAll},
     {GENERIC_READ, FILE_SHARE_READ}, false},
    {"anything after an exclusive open", {GENERIC_READ | GENERIC_WRITE, 0}, {GENERIC_READ, kShareAll}, false},
    {"an open without rights after an exclusive open", {GENERIC_READ | GENERIC_WRITE, 0}, {0, 0}, true},
    {"a reader that denies deletion after a deleter", {DELETE, kShareAll},
     {GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE}, false},
    {"a deleter after a reader that shares deletion", {GENERIC_READ, kShareAll}, {DELETE, kShareAll}, true},
    {"a reader and writer after one that shares everything", {GENERIC_READ | GENERIC_WRITE, kShareAll},
     {GENERIC_READ | GENERIC_WRITE, kShareAll}, true},
};

void CheckSecondOpen(const std::u16string& path, const Row& row) {
  SCOPED_TRACE(row.what);
  ScopedHandle second(OpenFile(path, row.second.access, row.second.share, OPEN_EXISTING));
  EXPECT_EQ(second.valid(), row.secondOpens);
  if (!row.secondOpens) {
    EXPECT_EQ(GetLastError(), ERROR_SHARING_VIOLATION);
  }
}

}  // namespace

TEST(FileSharing, OpensInOneProcessConflictAsWin32Says) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("shared.txt", "data");
  for (const Row& row : kRows) {
    ScopedHandle first(OpenFile(path, row.first.access, row.first.share, OPEN_EXISTING));
    ASSERT_TRUE(first.valid()) << row.what;
    CheckSecondOpen(path, row);
  }
  ScopedHandle free(OpenFile(path, GENERIC_READ | GENERIC_WRITE, 0, OPEN_EXISTING));
  EXPECT_TRUE(free.valid()) << "closed handles leave no trace";
}

TEST(FileSharing, OpensInAnotherProcessConflictAlike) {
  if (vyn::test::InChildProcess()) {
    const Row& row = kRows[std::atoi(std::getenv("VYN_SHARE_ROW"))];
    CheckSecondOpen(fs::path(std::getenv("VYN_SHARE_FILE")).u16string(), row);
    return;
  }
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("shared.txt", "data");
  for (std::size_t i = 0; i < std::size(kRows); ++i) {
    ScopedHandle first(OpenFile(path, kRows[i].first.access, kRows[i].first.share, OPEN_EXISTING));
    ASSERT_TRUE(first.valid());
    EXPECT_TRUE(vyn::test::RunCurrentTestInChild(
        {{"VYN_SHARE_ROW", std::to_string(i)}, {"VYN_SHARE_FILE", (dir.path() / "shared.txt").string()}}))
        << kRows[i].what;
  }
}

TEST(FileSharing, AProcessThatEndsTakesItsSharingWithIt) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("left.txt", "data");
  if (vyn::test::InChildProcess()) {
    // Opened exclusively and never closed: the process simply ends.
    HANDLE exclusive = OpenFile(fs::path(std::getenv("VYN_SHARE_FILE")).u16string(),
                                GENERIC_READ | GENERIC_WRITE, 0, OPEN_EXISTING);
    EXPECT_NE(exclusive, INVALID_HANDLE_VALUE);
    return;
  }
  ASSERT_TRUE(vyn::test::RunCurrentTestInChild({{"VYN_SHARE_FILE", (dir.path() / "left.txt").string()}}));
  ScopedHandle after(OpenFile(path, GENERIC_READ | GENERIC_WRITE, 0, OPEN_EXISTING));
  EXPECT_TRUE(after.valid());
}

TEST(FileSharing, DeletingAndRenamingNeedShareDelete) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("busy.txt", "data");
  {
    ScopedHandle reader(OpenFile(path, GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE, OPEN_EXISTING));
    EXPECT_FALSE(DeleteFileW(path.c_str()));
    EXPECT_EQ(GetLastError(), ERROR_SHARING_VIOLATION);
    EXPECT_FALSE(MoveFileExW(path.c_str(), dir.File("moved.txt").c_str(), 0));
    EXPECT_EQ(GetLastError(), ERROR_SHARING_VIOLATION);
    const std::u16string target = dir.Write("target.txt", "old");
    {
      ScopedHandle holder(OpenFile(target, GENERIC_READ, FILE_SHARE_READ, OPEN_EXISTING));
      ScopedHandle other(OpenFile(dir.Write("other.txt", "new"), GENERIC_READ, kShareAll, OPEN_EXISTING));
      EXPECT_FALSE(MoveFileExW(dir.File("other.txt").c_str(), target.c_str(), MOVEFILE_REPLACE_EXISTING))
          << "the replaced target is deleted too";
      EXPECT_EQ(GetLastError(), ERROR_SHARING_VIOLATION);
      EXPECT_EQ(vyn::test::Contents(dir.path() / "target.txt"), "old");
    }
    EXPECT_TRUE(fs::exists(dir.path() / "busy.txt"));
  }
  {
    ScopedHandle sharing(OpenFile(path, GENERIC_READ, kShareAll, OPEN_EXISTING));
    EXPECT_TRUE(MoveFileExW(path.c_str(), dir.File("moved.txt").c_str(), 0));
    EXPECT_TRUE(DeleteFileW(dir.File("moved.txt").c_str()));
  }
  EXPECT_FALSE(fs::exists(dir.path() / "moved.txt"));
}
