// CreateFileW and the calls on its handles, on real files in a temporary folder: dispositions
// and their last-error codes, refusals, reads at the end, seeks past it, truncation, bad
// handles, delete-on-close, and write failures (injected, and from a real file-size limit).

#include "win32/file_handle.h"

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>
#include <string>
#include <vector>

#include "file_test_helpers.h"
#include "support/child_process.h"
#include "support/temp_dir.h"
#include "syscalls.h"
#include "win32/crt_file.h"
#include "win32/find_file.h"
#include "win32/last_error.h"

namespace {

using namespace win32;
using vyn::test::Contents;
using vyn::test::OpenFile;
using vyn::test::ScopedHandle;
namespace fs = std::filesystem;

constexpr DWORD kReadWrite = GENERIC_READ | GENERIC_WRITE;
constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;

std::string Read(HANDLE file, DWORD bytes, DWORD* got) {
  std::string buffer(bytes, '\0');
  EXPECT_TRUE(ReadFile(file, buffer.data(), bytes, got, nullptr));
  buffer.resize(*got);
  return buffer;
}

bool Write(HANDLE file, const std::string& bytes) {
  DWORD written = 0;
  return WriteFile(file, bytes.data(), static_cast<DWORD>(bytes.size()), &written, nullptr) &&
         written == bytes.size();
}

LONGLONG Seek(HANDLE file, LONGLONG distance, DWORD method) {
  LARGE_INTEGER move{}, position{};
  move.QuadPart = distance;
  if (!SetFilePointerEx(file, move, &position, method)) return -1;
  return position.QuadPart;
}

}  // namespace

TEST(FileHandle, DispositionsCreateOpenAndTruncateAsWin32) {
  // CreateFileW documentation, dwCreationDisposition: what each does to a missing and to an
  // existing file, and the last error left on success.
  const struct {
    const char* what;
    bool exists;
    DWORD disposition, error;  // the last error after the call
    bool opens;
    const char* after;  // contents afterwards; null: no file
  } rows[] = {
      {"CREATE_NEW, missing", false, CREATE_NEW, ERROR_SUCCESS, true, ""},
      {"CREATE_NEW, existing", true, CREATE_NEW, ERROR_FILE_EXISTS, false, "old"},
      {"CREATE_ALWAYS, missing", false, CREATE_ALWAYS, ERROR_SUCCESS, true, ""},
      {"CREATE_ALWAYS, existing", true, CREATE_ALWAYS, ERROR_ALREADY_EXISTS, true, ""},
      {"OPEN_EXISTING, missing", false, OPEN_EXISTING, ERROR_FILE_NOT_FOUND, false, nullptr},
      {"OPEN_EXISTING, existing", true, OPEN_EXISTING, ERROR_SUCCESS, true, "old"},
      {"OPEN_ALWAYS, missing", false, OPEN_ALWAYS, ERROR_SUCCESS, true, ""},
      {"OPEN_ALWAYS, existing", true, OPEN_ALWAYS, ERROR_ALREADY_EXISTS, true, "old"},
      {"TRUNCATE_EXISTING, missing", false, TRUNCATE_EXISTING, ERROR_FILE_NOT_FOUND, false, nullptr},
      {"TRUNCATE_EXISTING, existing", true, TRUNCATE_EXISTING, ERROR_SUCCESS, true, ""},
  };
  vyn::test::TempDir dir;
  int n = 0;
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    const std::string name = "file" + std::to_string(n++);
    const std::u16string path = row.exists ? dir.Write(name, "old") : dir.File(name);
    SetLastError(12345);
    ScopedHandle file(OpenFile(path, kReadWrite, 0, row.disposition));
    EXPECT_EQ(file.valid(), row.opens);
    EXPECT_EQ(GetLastError(), row.error);
    file.Close();
    EXPECT_EQ(fs::exists(dir.path() / name), row.after != nullptr);
    if (row.after != nullptr) {
      EXPECT_EQ(Contents(dir.path() / name), row.after);
    }
  }
}

TEST(FileHandle, RefusalsGiveWin32Codes) {
  vyn::test::TempDir dir;
  const std::u16string file = dir.Write("file.txt", "data");
  fs::create_directory(dir.path() / "folder");
  const struct {
    const char* what;
    std::u16string path;
    DWORD access, share, disposition, error;
  } rows[] = {
      {"a missing folder", dir.File("no/such.txt"), GENERIC_READ, 0, OPEN_EXISTING, ERROR_PATH_NOT_FOUND},
      {"a new file in a missing folder", dir.File("no/such.txt"), GENERIC_WRITE, 0, CREATE_NEW, ERROR_PATH_NOT_FOUND},
      {"a file where a folder should be", dir.File("file.txt/x"), GENERIC_READ, 0, OPEN_EXISTING, ERROR_PATH_NOT_FOUND},
      // Windows opens no folder as a file, for reading or writing.
      {"a folder for reading", dir.File("folder"), GENERIC_READ, 0, OPEN_EXISTING, ERROR_ACCESS_DENIED},
      {"a folder for writing", dir.File("folder"), GENERIC_WRITE, 0, OPEN_ALWAYS, ERROR_ACCESS_DENIED},
      {"an empty name", u"", GENERIC_READ, 0, OPEN_EXISTING, ERROR_PATH_NOT_FOUND},
      {"disposition 0", file, GENERIC_READ, 0, 0, ERROR_INVALID_PARAMETER},
      {"disposition 6", file, GENERIC_READ, 0, 6, ERROR_INVALID_PARAMETER},
      {"an unknown share bit", file, GENERIC_READ, 0x8, OPEN_EXISTING, ERROR_INVALID_PARAMETER},
      {"TRUNCATE_EXISTING without write access", file, GENERIC_READ, 0, TRUNCATE_EXISTING, ERROR_INVALID_PARAMETER},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    SetLastError(0);
    EXPECT_EQ(OpenFile(row.path, row.access, row.share, row.disposition), INVALID_HANDLE_VALUE);
    EXPECT_EQ(GetLastError(), row.error);
  }
  EXPECT_EQ(CreateFileW(nullptr, GENERIC_READ, 0, nullptr, OPEN_EXISTING, 0, nullptr),
            INVALID_HANDLE_VALUE);
  EXPECT_EQ(GetLastError(), ERROR_PATH_NOT_FOUND);
}

TEST(FileHandle, ReadOnlyFilesRefuseWritingWhoeverAsks) {
  // The read-only attribute binds administrators too, so this holds when the tests run as root.
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("locked.txt", "keep me");
  fs::permissions(dir.path() / "locked.txt", fs::perms::owner_read | fs::perms::group_read);
  const struct {
    const char* what;
    DWORD access;
    DWORD disposition;
    DWORD flags;
  } refused[] = {
      {"write access", GENERIC_WRITE, OPEN_EXISTING, 0},
      {"CREATE_ALWAYS", GENERIC_WRITE, CREATE_ALWAYS, 0},
      {"TRUNCATE_EXISTING", GENERIC_WRITE, TRUNCATE_EXISTING, 0},
      {"delete on close", GENERIC_READ, OPEN_EXISTING, FILE_FLAG_DELETE_ON_CLOSE},
  };
  for (const auto& row : refused) {
    SCOPED_TRACE(row.what);
    EXPECT_EQ(OpenFile(path, row.access, 0, row.disposition, row.flags), INVALID_HANDLE_VALUE);
    EXPECT_EQ(GetLastError(), ERROR_ACCESS_DENIED);
    EXPECT_EQ(Contents(dir.path() / "locked.txt"), "keep me") << "nothing was cut";
  }
  ScopedHandle reader(OpenFile(path, GENERIC_READ, FILE_SHARE_READ, OPEN_EXISTING));
  EXPECT_TRUE(reader.valid()) << "reading is allowed";

  // FILE_ATTRIBUTE_READONLY on creation: the new file is read-only, this handle still writes.
  ScopedHandle created(OpenFile(dir.File("new.txt"), GENERIC_WRITE, 0, CREATE_NEW,
                                FILE_ATTRIBUTE_READONLY));
  ASSERT_TRUE(created.valid());
  EXPECT_TRUE(Write(created.get(), "abc"));
  created.Close();
  EXPECT_EQ(Contents(dir.path() / "new.txt"), "abc");
  EXPECT_EQ(fs::status(dir.path() / "new.txt").permissions() & fs::perms::owner_write,
            fs::perms::none);
}

TEST(FileHandle, ReadsStopAtTheEndAndSeeksPastItLeaveZeros) {
  vyn::test::TempDir dir;
  ScopedHandle file(OpenFile(dir.File("data.bin"), kReadWrite, 0, CREATE_NEW));
  ASSERT_TRUE(file.valid());
  ASSERT_TRUE(Write(file.get(), "hello world"));
  EXPECT_EQ(Seek(file.get(), 0, FILE_BEGIN), 0);
  DWORD got = 0;
  EXPECT_EQ(Read(file.get(), 5, &got), "hello");
  EXPECT_EQ(Read(file.get(), 100, &got), " world") << "a partial read at the end";
  EXPECT_EQ(got, 6u);
  EXPECT_EQ(Read(file.get(), 100, &got), "") << "TRUE with 0 bytes at the end";

  EXPECT_EQ(Seek(file.get(), 10, FILE_END), 21);
  ASSERT_TRUE(Write(file.get(), "X"));
  EXPECT_EQ(Contents(dir.path() / "data.bin"), std::string("hello world") + std::string(10, '\0') + "X");
  LARGE_INTEGER size{};
  ASSERT_TRUE(GetFileSizeEx(file.get(), &size));
  EXPECT_EQ(size.QuadPart, 22);

  // SetFilePointerEx documentation: a move before the start fails and leaves the pointer.
  EXPECT_EQ(Seek(file.get(), -5, FILE_CURRENT), 17);
  EXPECT_EQ(Seek(file.get(), -18, FILE_CURRENT), -1);
  EXPECT_EQ(GetLastError(), ERROR_NEGATIVE_SEEK);
  EXPECT_EQ(Seek(file.get(), -23, FILE_END), -1);
  EXPECT_EQ(GetLastError(), ERROR_NEGATIVE_SEEK);
  EXPECT_EQ(Seek(file.get(), 0, FILE_CURRENT), 17);
  EXPECT_EQ(Seek(file.get(), 0, 3), -1);
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);

  // SetEndOfFile cuts at the pointer, or extends with zeros.
  EXPECT_EQ(Seek(file.get(), 4, FILE_BEGIN), 4);
  ASSERT_TRUE(SetEndOfFile(file.get()));
  EXPECT_EQ(Contents(dir.path() / "data.bin"), "hell");
  EXPECT_EQ(Seek(file.get(), 8, FILE_BEGIN), 8);
  ASSERT_TRUE(SetEndOfFile(file.get()));
  EXPECT_EQ(Contents(dir.path() / "data.bin"), std::string("hell") + std::string(4, '\0'));
  EXPECT_TRUE(FlushFileBuffers(file.get()));
}

TEST(FileHandle, AccessRightsHoldPerHandle) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("rights.txt", "abc");
  ScopedHandle reader(OpenFile(path, GENERIC_READ, kShareAll, OPEN_EXISTING));
  ScopedHandle writer(OpenFile(path, GENERIC_WRITE, kShareAll, OPEN_EXISTING));
  ASSERT_TRUE(reader.valid() && writer.valid());
  DWORD count = 7;
  char buffer[4];
  EXPECT_FALSE(WriteFile(reader.get(), "x", 1, &count, nullptr));
  EXPECT_EQ(GetLastError(), ERROR_ACCESS_DENIED);
  EXPECT_EQ(count, 0u);
  EXPECT_FALSE(SetEndOfFile(reader.get()));
  EXPECT_EQ(GetLastError(), ERROR_ACCESS_DENIED);
  EXPECT_FALSE(FlushFileBuffers(reader.get()));
  EXPECT_EQ(GetLastError(), ERROR_ACCESS_DENIED);
  EXPECT_FALSE(ReadFile(writer.get(), buffer, 1, &count, nullptr));
  EXPECT_EQ(GetLastError(), ERROR_ACCESS_DENIED);
  // Asynchronous transfers are not offered, and the count pointer is required.
  auto* overlapped = reinterpret_cast<OVERLAPPED*>(buffer);
  EXPECT_FALSE(ReadFile(reader.get(), buffer, 1, &count, overlapped));
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
  EXPECT_FALSE(ReadFile(reader.get(), buffer, 1, nullptr, nullptr));
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
}

TEST(FileHandle, BadHandlesAreRefusedNeverFollowed) {
  vyn::test::TempDir dir;
  HANDLE first = OpenFile(dir.File("a"), kReadWrite, kShareAll, CREATE_NEW);
  HANDLE second = OpenFile(dir.File("a"), kReadWrite, kShareAll, OPEN_EXISTING);
  ASSERT_NE(first, INVALID_HANDLE_VALUE);
  ASSERT_NE(second, INVALID_HANDLE_VALUE);
  EXPECT_NE(first, nullptr);
  EXPECT_NE(first, second);
  EXPECT_TRUE(CloseHandle(first));
  EXPECT_TRUE(CloseHandle(second));
  char byte = 0;
  DWORD count = 0;
  LARGE_INTEGER size{};
  for (HANDLE bad : {first, static_cast<HANDLE>(nullptr), INVALID_HANDLE_VALUE,
                     reinterpret_cast<HANDLE>(0x12340)}) {
    SCOPED_TRACE(reinterpret_cast<std::uintptr_t>(bad));
    EXPECT_FALSE(CloseHandle(bad));
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
    EXPECT_FALSE(ReadFile(bad, &byte, 1, &count, nullptr));
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
    EXPECT_FALSE(WriteFile(bad, &byte, 1, &count, nullptr));
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
    EXPECT_FALSE(GetFileSizeEx(bad, &size));
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
  }
  // A search handle is no file handle, and CloseHandle does not take it.
  WIN32_FIND_DATAW found;
  HANDLE search = FindFirstFileW(dir.File("*").c_str(), &found);
  ASSERT_NE(search, INVALID_HANDLE_VALUE);
  EXPECT_FALSE(ReadFile(search, &byte, 1, &count, nullptr));
  EXPECT_FALSE(CloseHandle(search));
  EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
  EXPECT_TRUE(FindClose(search));
}

TEST(FileHandle, DeleteOnCloseWaitsForTheLastHandle) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.File("scratch.tmp");
  const fs::path file = dir.path() / "scratch.tmp";
  ScopedHandle first(OpenFile(path, kReadWrite, kShareAll, CREATE_NEW,
                              FILE_ATTRIBUTE_TEMPORARY | FILE_FLAG_DELETE_ON_CLOSE));
  ASSERT_TRUE(first.valid());
  ASSERT_TRUE(Write(first.get(), "temporary"));
  // Delete-on-close holds delete access: a later open must share deletion.
  EXPECT_EQ(OpenFile(path, GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE, OPEN_EXISTING),
            INVALID_HANDLE_VALUE);
  EXPECT_EQ(GetLastError(), ERROR_SHARING_VIOLATION);
  ScopedHandle second(OpenFile(path, GENERIC_READ, kShareAll, OPEN_EXISTING));
  ASSERT_TRUE(second.valid());
  EXPECT_TRUE(first.Close());
  EXPECT_TRUE(fs::exists(file)) << "another handle is still open";
  DWORD got = 0;
  EXPECT_EQ(Read(second.get(), 100, &got), "temporary");
  EXPECT_TRUE(second.Close());
  EXPECT_FALSE(fs::exists(file));

  // An open that fails deletes nothing.
  const std::u16string kept = dir.Write("kept.txt", "x");
  ScopedHandle holder(OpenFile(kept, GENERIC_READ, FILE_SHARE_READ, OPEN_EXISTING));
  EXPECT_EQ(OpenFile(kept, GENERIC_READ, kShareAll, OPEN_EXISTING, FILE_FLAG_DELETE_ON_CLOSE),
            INVALID_HANDLE_VALUE);
  EXPECT_EQ(GetLastError(), ERROR_SHARING_VIOLATION);
  holder.Close();
  EXPECT_TRUE(fs::exists(dir.path() / "kept.txt"));

  // A file replaced under the same name after the open is not the one deleted.
  ScopedHandle doomed(OpenFile(dir.File("swap.txt"), kReadWrite, kShareAll, CREATE_NEW,
                               FILE_FLAG_DELETE_ON_CLOSE));
  ASSERT_TRUE(doomed.valid());
  fs::remove(dir.path() / "swap.txt");
  dir.Write("swap.txt", "new");
  doomed.Close();
  EXPECT_EQ(Contents(dir.path() / "swap.txt"), "new");
}

TEST(FileHandle, FlagsReachTheSystem) {
  vyn::test::TempDir dir;
  static int openFlags, advice;
  sys::ScopedSyscalls calls;
  calls.table().open = [](const char* path, int flags, mode_t mode) {
    openFlags = flags;
    return sys::DefaultSyscalls().open(path, flags, mode);
  };
  calls.table().fadvise = [](int, off_t, off_t, int given) {
    advice = given;
    return 0;
  };
  const struct {
    DWORD flags;
    int dsync;
    int advice;
  } rows[] = {
      {FILE_FLAG_WRITE_THROUGH, O_DSYNC, 0},
      {FILE_FLAG_SEQUENTIAL_SCAN, 0, POSIX_FADV_SEQUENTIAL},
      {FILE_FLAG_RANDOM_ACCESS, 0, POSIX_FADV_RANDOM},
      {FILE_FLAG_RANDOM_ACCESS | FILE_FLAG_SEQUENTIAL_SCAN, 0, POSIX_FADV_RANDOM},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.flags);
    openFlags = 0;
    advice = 0;
    ScopedHandle file(OpenFile(dir.File("flags"), kReadWrite, 0, OPEN_ALWAYS, row.flags));
    ASSERT_TRUE(file.valid());
    EXPECT_EQ(openFlags & O_DSYNC, row.dsync);
    EXPECT_EQ(openFlags & O_CLOEXEC, O_CLOEXEC) << "no handle leaks into child programs";
    EXPECT_EQ(advice, row.advice);
  }
}

namespace {

// Write replacements for fault injection: the first call writes half, the next fails.
int g_failWith;
int g_writeCalls;
ssize_t HalfThenFail(int fd, const void* data, size_t bytes) {
  if (g_writeCalls++ == 0) return sys::DefaultSyscalls().write(fd, data, bytes / 2);
  errno = g_failWith;
  return -1;
}

}  // namespace

TEST(FileHandle, FailedWritesReportDiskFullAndWhatWasWritten) {
  vyn::test::TempDir dir;
  ScopedHandle file(OpenFile(dir.File("full.bin"), kReadWrite, 0, CREATE_NEW));
  ASSERT_TRUE(file.valid());
  // No space, no quota and a file too large are all "disk full" to Windows callers.
  for (int error : {ENOSPC, EDQUOT, EFBIG}) {
    SCOPED_TRACE(error);
    sys::ScopedSyscalls calls;
    calls.table().write = HalfThenFail;
    g_failWith = error;
    g_writeCalls = 0;
    ASSERT_EQ(Seek(file.get(), 0, FILE_BEGIN), 0);
    DWORD written = 99;
    EXPECT_FALSE(WriteFile(file.get(), "0123456789", 10, &written, nullptr));
    EXPECT_EQ(GetLastError(), ERROR_DISK_FULL);
    EXPECT_EQ(written, 5u) << "the part written is reported";
  }
  EXPECT_EQ(Contents(dir.path() / "full.bin"), "01234");
  // An interrupted write is carried on, not reported.
  sys::ScopedSyscalls calls;
  calls.table().write = [](int fd, const void* data, size_t bytes) -> ssize_t {
    if (g_writeCalls++ % 2 == 0) {
      errno = EINTR;
      return -1;
    }
    return sys::DefaultSyscalls().write(fd, data, 1);
  };
  g_writeCalls = 0;
  ASSERT_EQ(Seek(file.get(), 0, FILE_BEGIN), 0);
  EXPECT_TRUE(Write(file.get(), "abcdef"));
  EXPECT_EQ(Contents(dir.path() / "full.bin"), "abcdef");
}

TEST(FileHandle, FileSizeLimitGivesDiskFullNotASignal) {
  if (!vyn::test::InChildProcess()) {
    // The limit and a possible SIGXFSZ stay in a child of this program.
    ASSERT_TRUE(vyn::test::RunCurrentTestInChild({}));
    return;
  }
  vyn::test::TempDir dir;
  const rlimit limit{1000, 1000};
  ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &limit), 0);
  ScopedHandle file(OpenFile(dir.File("limited.bin"), kReadWrite, 0, CREATE_NEW));
  ASSERT_TRUE(file.valid());
  const std::string block(4096, 'z');
  DWORD written = 0;
  EXPECT_FALSE(WriteFile(file.get(), block.data(), 4096, &written, nullptr));
  EXPECT_EQ(GetLastError(), ERROR_DISK_FULL);
  EXPECT_EQ(written, 1000u);
  EXPECT_EQ(Seek(file.get(), 5000, FILE_BEGIN), 5000);
  EXPECT_FALSE(SetEndOfFile(file.get()));
  EXPECT_EQ(GetLastError(), ERROR_DISK_FULL);
  FILE* stream = std::fopen((dir.path() / "stream.bin").c_str(), "wb");
  ASSERT_NE(stream, nullptr);
  EXPECT_EQ(_chsize_s(_fileno(stream), 5000), ENOSPC);
  std::fclose(stream);
  sigset_t pending;
  sigpending(&pending);
  EXPECT_FALSE(sigismember(&pending, SIGXFSZ)) << "no signal is left waiting";
}
