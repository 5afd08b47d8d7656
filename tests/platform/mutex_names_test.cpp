// Mutex names (what is the same mutex and what is refused) and the handles of mutexes.

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <string>
#include <thread>

#include "file_test_helpers.h"
#include "support/temp_dir.h"
#include "win32/last_error.h"
#include "win32/sync.h"

namespace {

using namespace win32;
using vyn::test::ScopedHandle;

std::u16string Unique(const char* stem) {
  const std::string name = stem + std::to_string(getpid());
  return std::u16string(name.begin(), name.end());
}

// What a wait of another thread gets (it releases what it got).
DWORD WaitElsewhereResult(HANDLE mutex) {
  DWORD result = WAIT_FAILED;
  std::thread([&] {
    result = WaitForSingleObject(mutex, 0);
    if (result == WAIT_OBJECT_0) ReleaseMutex(mutex);
  }).join();
  return result;
}

}  // namespace

TEST(MutexNames, SameAndDifferentMutexes) {
  const std::u16string base = Unique("Vyn.Names.");
  ScopedHandle first(CreateMutexW(nullptr, TRUE, base.c_str()));
  ASSERT_TRUE(first.valid());
  EXPECT_EQ(GetLastError(), ERROR_SUCCESS);
  struct Row {
    const char* what;
    std::u16string name;
    DWORD lastError;
  };
  // CreateMutexW page: an existing named mutex is opened with ERROR_ALREADY_EXISTS; kernel object
  // namespaces: "Local\" is the session's own namespace, the one of unprefixed names.
  const Row rows[] = {
      {"the same name", base, ERROR_ALREADY_EXISTS},
      {"the session prefix", u"Local\\" + base, ERROR_ALREADY_EXISTS},
      {"the global namespace", u"Global\\" + base, ERROR_SUCCESS},
      {"other letter case", Unique("vyn.names."), ERROR_SUCCESS},
      {"a slash", base + u"/", ERROR_SUCCESS},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.what);
    std::thread([&] {
      ScopedHandle other(CreateMutexW(nullptr, TRUE, row.name.c_str()));
      ASSERT_TRUE(other.valid());
      EXPECT_EQ(GetLastError(), row.lastError);
      // The initial owner gets only a mutex it created.
      EXPECT_EQ(WaitForSingleObject(other.get(), 0), row.lastError == ERROR_SUCCESS ? WAIT_OBJECT_0 : WAIT_TIMEOUT);
    }).join();
  }
  // Those rows' threads closed the mutexes they owned and ended: the next close releases them,
  // and their objects go, as no other process has them open.
  CloseHandle(CreateMutexW(nullptr, FALSE, nullptr));
  int objects = 0;
  for (const auto& entry : std::filesystem::directory_iterator("/dev/shm")) {
    objects += entry.path().filename().string().find("ames." + std::to_string(getpid())) != std::string::npos;
  }
  EXPECT_EQ(objects, 1);

  // CreateMutexA takes the name in the ANSI code page (1252 in tests): E9 is U+00E9.
  ScopedHandle wide(CreateMutexW(nullptr, FALSE, (base + u"\u00E9").c_str()));
  const std::string narrow = std::string("Vyn.Names.") + std::to_string(getpid()) + "\xE9";
  ScopedHandle ansi(CreateMutexA(nullptr, FALSE, narrow.c_str()));
  EXPECT_EQ(GetLastError(), ERROR_ALREADY_EXISTS);

  ScopedHandle opened(OpenMutexW(SYNCHRONIZE, FALSE, base.c_str()));
  EXPECT_TRUE(opened.valid());
  EXPECT_EQ(WaitElsewhereResult(opened.get()), WAIT_TIMEOUT);
  EXPECT_TRUE(ReleaseMutex(first.get()));
}

TEST(MutexNames, RefusedNames) {
  struct Row {
    const char* what;
    std::u16string name;
    DWORD error;
  };
  // CreateMutexW page: names are limited to MAX_PATH characters; "\" separates the namespace.
  const Row rows[] = {
      {"longer than MAX_PATH", std::u16string(300, u'n'), ERROR_FILENAME_EXCED_RANGE},
      {"a backslash inside", u"Vyn\\Mutex", ERROR_PATH_NOT_FOUND},
      {"a prefix alone", u"Local\\", ERROR_INVALID_NAME},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.what);
    SetLastError(0);
    EXPECT_EQ(CreateMutexW(nullptr, FALSE, row.name.c_str()), nullptr);
    EXPECT_EQ(GetLastError(), row.error);
  }
  ScopedHandle longest(CreateMutexW(nullptr, FALSE, (Unique("Vyn.") + std::u16string(250, u'm')).substr(0, 260).c_str()));
  EXPECT_TRUE(longest.valid()) << "MAX_PATH units are allowed";
  EXPECT_EQ(OpenMutexW(SYNCHRONIZE, FALSE, Unique("Vyn.Absent.").c_str()), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND);
}

TEST(MutexNames, OnlyLiveMutexHandlesAreWaitedOn) {
  vyn::test::TempDir dir;
  ScopedHandle file(vyn::test::OpenFile(dir.Write("f.txt", "x"), GENERIC_READ, FILE_SHARE_READ, OPEN_EXISTING));
  HANDLE closed = CreateMutexW(nullptr, FALSE, Unique("Vyn.Closed.").c_str());
  ASSERT_EQ(WaitForSingleObject(closed, 0), WAIT_OBJECT_0);
  ASSERT_TRUE(ReleaseMutex(closed));
  ASSERT_TRUE(CloseHandle(closed));
  EXPECT_FALSE(CloseHandle(closed));
  // The thread just used the closed handle: it must not be served from the thread's memory.
  for (HANDLE handle : {closed, file.get(), static_cast<HANDLE>(nullptr), INVALID_HANDLE_VALUE}) {
    SetLastError(0);
    EXPECT_EQ(WaitForSingleObject(handle, 0), WAIT_FAILED);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
    SetLastError(0);
    EXPECT_FALSE(ReleaseMutex(handle));
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
  }
}
