// _wfopen on real files in a temporary folder: mode letters, Windows paths, errno on failure.

#include "win32/crt_stdio.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <string>

#include "file_test_helpers.h"
#include "support/temp_dir.h"
#include "syscalls.h"
#include "win32/path_map.h"

namespace {

using vyn::test::Contents;
using win32::_wfopen;

bool Write(const std::u16string& path, const char16_t* mode, const std::string& text) {
  FILE* file = _wfopen(path.c_str(), mode);
  if (file == nullptr) return false;
  const bool written = std::fwrite(text.data(), 1, text.size(), file) == text.size();
  return std::fclose(file) == 0 && written;
}

}  // namespace

TEST(CrtStdio, ModesWriteAndAppend) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.File("modes.txt");
  // A Windows path, through a drive root.
  win32::SetDriveRoot(u'T', dir.path().c_str());
  const bool written = Write(u"t:\\modes.txt", u"w", "one\r\n");
  win32::SetDriveRoot(u'T', nullptr);
  ASSERT_TRUE(written);
  ASSERT_TRUE(Write(path, u"ab", "two"));
  EXPECT_EQ(Contents(dir.path() / "modes.txt"), "one\r\ntwo");
  ASSERT_TRUE(Write(path, u"wb, ccs=UTF-8", "three"));
  EXPECT_EQ(Contents(dir.path() / "modes.txt"), "three") << "'w' truncates; ccs= is accepted";
}

TEST(CrtStdio, RefusesModesTheRuntimeRefuses) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("exists.txt", "x");
  // fopen, _wfopen page: 'r', 'w' or 'a' first, then '+', 'b' or 't'; b and t exclude each other.
  for (const char16_t* mode :
       {u"", u"x", u"q", u"rw", u"rbb", u"rbt", u"r++", u"br", u"r, ccs=", u"r; ccs=UTF-8",
        u"r, ccx=UTF-8", static_cast<const char16_t*>(nullptr)}) {
    SCOPED_TRACE(testing::PrintToString(std::u16string(mode ? mode : u"(null)")));
    errno = 0;
    FILE* file = _wfopen(path.c_str(), mode);
    EXPECT_EQ(file, nullptr);
    if (file != nullptr) std::fclose(file);
    EXPECT_EQ(errno, EINVAL);
  }
  for (const char16_t* mode : {u"r", u"rb", u"rt", u"r+b", u"rb+", u"a+", u"r , ccs=UNICODE"}) {
    SCOPED_TRACE(testing::PrintToString(std::u16string(mode)));
    FILE* file = _wfopen(path.c_str(), mode);
    EXPECT_NE(file, nullptr);
    if (file != nullptr) std::fclose(file);
  }
}

TEST(CrtStdio, FailuresSetErrno) {
  vyn::test::TempDir dir;
  struct Row {
    const char* what;
    std::u16string path;
    const char16_t* mode;
    int error;
  };
  const Row rows[] = {
      {"a missing file", dir.File("missing.txt"), u"r", ENOENT},
      {"a missing folder", dir.File("no/such/file.txt"), u"w", ENOENT},
      // Windows will not open a folder as a file, for reading or writing.
      {"a folder opened for reading", dir.File(""), u"r", EACCES},
      {"a folder opened for writing", dir.File(""), u"w", EACCES},
      {"an empty path", u"", u"r", EINVAL},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.what);
    errno = 0;
    EXPECT_EQ(_wfopen(row.path.c_str(), row.mode), nullptr);
    EXPECT_EQ(errno, row.error);
  }
  EXPECT_EQ(_wfopen(nullptr, u"r"), nullptr);
  EXPECT_EQ(errno, EINVAL);
}

TEST(CrtStdio, AFailingSystemCallReachesTheCaller) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("busy.txt", "x");
  {
    win32::sys::ScopedSyscalls calls;
    calls.table().fopen = [](const char*, const char*) -> FILE* {
      errno = EMFILE;
      return nullptr;
    };
    errno = 0;
    EXPECT_EQ(_wfopen(path.c_str(), u"r"), nullptr);
    EXPECT_EQ(errno, EMFILE);
  }
  EXPECT_EQ(win32::sys::Syscalls().fopen, win32::sys::DefaultSyscalls().fopen)
      << "the table is restored at the end of the scope";
  FILE* file = _wfopen(path.c_str(), u"r");
  ASSERT_NE(file, nullptr);
  std::fclose(file);
}
