// The profile write functions: the bytes each write leaves in the file, and every way a write
// fails without touching it. Sources as in profile_read_test.cpp ([docs], [wine], [re]).

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <filesystem>
#include <functional>

#include "profile_test_support.h"
#include "scoped_env.h"
#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/file_handle.h"
#include "win32/profile.h"

namespace {

using namespace vyn::test;
using namespace win32;
namespace fs = std::filesystem;

using Call = std::function<BOOL(const MCHAR* file)>;

BOOL Set(const MCHAR* section, const MCHAR* key, const MCHAR* value, const MCHAR* file) {
  return WritePrivateProfileStringW(section, key, value, file);
}

std::size_t FilesIn(const fs::path& folder) {
  return static_cast<std::size_t>(std::distance(fs::directory_iterator(folder), fs::directory_iterator()));
}

}  // namespace

// Each write changes the lines it must and nothing else.
TEST(ProfileWrite, EditsTouchOnlyTheirLines) {
  const struct {
    const char* name;
    std::string before;
    Call call;
    std::string after;
  } rows[] = {
      // [wine] NULs before the first section stay; a line break goes before the new section.
      {"NulsAndNoFinalBreak", std::string("Data \0 before \0 first \0 section", 31),
       [](auto f) { return Set(u"section1", u"key1", u"string1", f); },
       std::string("Data \0 before \0 first \0 section\r\n[section1]\r\nkey1=string1\r\n", 59)},
      {"NewKeyAfterLastEntry", "[a]\r\nx=1\r\n\r\n; about b\r\n[b]\r\ny=2\r\n",
       [](auto f) { return Set(u"A", u"z", u"3", f); },
       "[a]\r\nx=1\r\nz=3\r\n\r\n; about b\r\n[b]\r\ny=2\r\n"},
      {"NewKeyInHeaderOnlySection", "[a]", [](auto f) { return Set(u"a", u"k", u"v", f); },
       "[a]\r\nk=v\r\n"},
      // [re] the existing spelling of section and key wins; here the spacing and LF too.
      {"ChangedKeyKeepsItsLine", "[Sec]\n  Name = old value  \n;after\n",
       [](auto f) { return Set(u"SEC", u"name", u"new", f); }, "[Sec]\n  Name = new\n;after\n"},
      {"ChangedEmptyValue", "[s]\nk=\n", [](auto f) { return Set(u"s", u"k", u" v ", f); },
       "[s]\nk= v \n"},
      {"DeleteKeyAndItsRepeats", "[a]\r\nk=1\r\n;k=c\r\nK=2\r\n[A]\r\nk=3\r\n",
       [](auto f) { return Set(u"a", u"k", nullptr, f); }, "[a]\r\n;k=c\r\n[A]\r\nk=3\r\n"},
      // [re] comments stay when their section goes.
      {"DeleteSectionKeepsComments", "[a]\r\n; note\r\nk=1\r\nlone\r\n[b]\r\nj=2\r\n[A]\r\nm=3\r\n",
       [](auto f) { return Set(u"a", nullptr, u"ignored", f); }, "; note\r\n[b]\r\nj=2\r\n"},
      {"ReplaceSectionInPlace", "[a]\r\n; c\r\nx=1\r\nlone\r\ny=2\r\n\r\n[b]\r\n",
       [](auto f) { return WritePrivateProfileSectionW(u"a", u"p=1\0q = 2\0", f); },
       "[a]\r\n; c\r\np=1\r\nq = 2\r\n\r\n[b]\r\n"},
      {"ReplaceMissingSection", "[b]\r\nj=1",
       [](auto f) { return WritePrivateProfileSectionW(u"a", u"p=1\0", f); },
       "[b]\r\nj=1\r\n[a]\r\np=1\r\n"},
      {"ReplaceWithNothing", "[a]\r\nx=1\r\n[b]\r\n",
       [](auto f) { return WritePrivateProfileSectionW(u"a", u"\0", f); }, "[a]\r\n[b]\r\n"},
      {"DeleteSectionBySectionWrite", "[a]\r\nx=1\r\n[b]\r\n",
       [](auto f) { return WritePrivateProfileSectionW(u"a", nullptr, f); }, "[b]\r\n"},
      // [re] a key may start with ';': Windows writes it, and it reads as a comment.
      {"SemicolonKey", "", [](auto f) { return Set(u"s", u";note", u"x", f); }, "[s]\r\n;note=x\r\n"},
  };
  TempDir dir;
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    const std::u16string file = dir.Write("e.ini", row.before);
    EXPECT_TRUE(row.call(file.c_str()));
    EXPECT_EQ(GetLastError(), ERROR_SUCCESS);
    EXPECT_EQ(Bytes(dir, "e.ini"), row.after);
  }
}

// [wine] test_WritePrivateProfileString, building up a file from nothing and taking it apart;
// [re] new keys in the order they were written, existing ones where they stand.
TEST(ProfileWrite, BuildsAndTakesApartAsWindows) {
  TempDir dir;
  const std::u16string path = dir.File("w.ini");
  const MCHAR* file = path.c_str();
  SetLastError(0xDEADBEEF);
  EXPECT_TRUE(Set(u"App1", u"key1", u"string1", file));
  EXPECT_EQ(GetLastError(), ERROR_FILE_NOT_FOUND) << "Windows reports the file it created";
  Set(u"App1", u"key2", u"string2", file);
  Set(u"App1", u"key3", u"string3", file);
  Set(u"App2", u"key4", u"string4", file);
  Set(u"App3", u"key5", u"string5", file);
  EXPECT_EQ(Bytes(dir, "w.ini"),
            "[App1]\r\nkey1=string1\r\nkey2=string2\r\nkey3=string3\r\n[App2]\r\nkey4=string4\r\n"
            "[App3]\r\nkey5=string5\r\n");
  EXPECT_TRUE(Set(u"App1", u"key2", nullptr, file));
  EXPECT_TRUE(Set(u"App1", u"key2", nullptr, file));  // deleting it again is no error
  EXPECT_TRUE(Set(u"App1", nullptr, u"string1", file));
  EXPECT_TRUE(Set(u"App2", nullptr, nullptr, file));
  EXPECT_EQ(Bytes(dir, "w.ini"), "[App3]\r\nkey5=string5\r\n");
  EXPECT_TRUE(Set(u"App3", u"key5", nullptr, file));
  EXPECT_EQ(Bytes(dir, "w.ini"), "[App3]\r\n");

  dir.Write("o.ini", "[s]\r\nb=value\r\na=value\r\n");
  for (const MCHAR* key : {u"z", u"b", u"y", u"a"}) Set(u"s", key, u"", dir.File("o.ini").c_str());
  EXPECT_EQ(Bytes(dir, "o.ini"), "[s]\r\nb=\r\na=\r\nz=\r\ny=\r\n");

  // [wine] Deleting from a missing file creates it, empty; an empty value is written as "key=".
  EXPECT_TRUE(Set(u"App", nullptr, u"string", dir.File("d.ini").c_str()));
  EXPECT_EQ(Bytes(dir, "d.ini"), "");
  EXPECT_TRUE(Set(u"App", u"key", u"", dir.File("d.ini").c_str()));
  EXPECT_EQ(Bytes(dir, "d.ini"), "[App]\r\nkey=\r\n");
  // [re] names lose their surrounding spaces, values keep them.
  EXPECT_TRUE(Set(u"   sec   ", u"  key  ", u" value ", dir.File("sp.ini").c_str()));
  EXPECT_EQ(Bytes(dir, "sp.ini"), "[sec]\r\nkey= value \r\n");
}

// Writes that cannot be made leave the file as it was and say why.
TEST(ProfileWrite, FailuresLeaveTheFileAlone) {
  TempDir dir;
  const std::string original = "[s]\r\nk=1\r\n";
  const std::u16string path = dir.Write("f.ini", original);
  const MCHAR* file = path.c_str();
  const struct {
    const char* name;
    Call call;
    DWORD error;
  } rows[] = {
      // [wine] a null section is refused with ERROR_FILE_NOT_FOUND.
      {"NullSection", [](auto f) { return Set(nullptr, u"k", u"v", f); }, ERROR_FILE_NOT_FOUND},
      {"NullSectionStruct", [](auto f) { return WritePrivateProfileStructW(nullptr, u"k", "x", 1, f); }, ERROR_FILE_NOT_FOUND},
      // Text that would change how the file reads (Windows writes it and corrupts the file).
      {"BracketInSection", [](auto f) { return Set(u"a]b", u"k", u"v", f); }, ERROR_INVALID_PARAMETER},
      {"BreakInSection", [](auto f) { return Set(u"a\nb", u"k", u"v", f); }, ERROR_INVALID_PARAMETER},
      {"EqualsInKey", [](auto f) { return Set(u"s", u"k=x", u"v", f); }, ERROR_INVALID_PARAMETER},
      {"KeyOpensSection", [](auto f) { return Set(u"s", u" [k]", u"v", f); }, ERROR_INVALID_PARAMETER},
      {"BreakInValue", [](auto f) { return Set(u"s", u"k", u"v\r\nk2=w", f); }, ERROR_INVALID_PARAMETER},
      {"BreakInSectionLine", [](auto f) { return WritePrivateProfileSectionW(u"s", u"a=1\nb=2\0", f); }, ERROR_INVALID_PARAMETER},
      {"HeaderInSectionLine", [](auto f) { return WritePrivateProfileSectionW(u"s", u"a=1\0[t]\0", f); }, ERROR_INVALID_PARAMETER},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    SetLastError(0xDEADBEEF);
    EXPECT_FALSE(row.call(file));
    EXPECT_EQ(GetLastError(), row.error);
    EXPECT_EQ(Bytes(dir, "f.ini"), original);
  }
  // [docs] all arguments null flushes the cached file and returns zero.
  EXPECT_FALSE(Set(nullptr, nullptr, nullptr, file));

  // [wine] an empty name is the Windows folder itself; [re] missing folders are not created.
  ScopedEnv windows("TAVLO_PLATFORM_WINDIR", dir.path().c_str());
  EXPECT_FALSE(Set(u"s", u"k", u"v", u""));
  EXPECT_EQ(GetLastError(), ERROR_ACCESS_DENIED);
  EXPECT_FALSE(Set(u"s", u"k", u"v", dir.File("no/such/f.ini").c_str()));
  EXPECT_EQ(GetLastError(), ERROR_PATH_NOT_FOUND);
  EXPECT_FALSE(fs::exists(dir.path() / "no"));
  fs::create_directory(dir.path() / "folder.ini");
  EXPECT_FALSE(Set(u"s", u"k", u"v", dir.File("folder.ini").c_str()));
  EXPECT_EQ(GetLastError(), ERROR_ACCESS_DENIED);

  // A read-only file (the Windows read-only attribute binds even administrators).
  fs::permissions(dir.path() / "f.ini", fs::perms::owner_read | fs::perms::group_read);
  EXPECT_FALSE(Set(u"s", u"k", u"2", file));
  EXPECT_EQ(GetLastError(), ERROR_ACCESS_DENIED);
  EXPECT_EQ(Bytes(dir, "f.ini"), original);
  fs::permissions(dir.path() / "f.ini", fs::perms::owner_read | fs::perms::owner_write);

  // [wine] test_profile_existing: a handle that denies others writing blocks a profile write.
  {
    ScopedHandle open(OpenFile(path, GENERIC_READ, FILE_SHARE_READ, OPEN_EXISTING));
    ASSERT_TRUE(open.valid());
    EXPECT_FALSE(Set(u"s", u"k", u"2", file));
    EXPECT_EQ(GetLastError(), ERROR_SHARING_VIOLATION);
  }
  {
    ScopedHandle open(OpenFile(path, GENERIC_READ | GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE, OPEN_EXISTING));
    EXPECT_TRUE(Set(u"s", u"k", u"2", file));
  }

  // A folder this process may not write to. The superuser may write anywhere, so as the
  // superuser the check runs in a child process that has given up its rights.
  fs::create_directory(dir.path() / "ro");
  const std::u16string inside = dir.Write("ro/r.ini", original);
  fs::permissions(dir.path() / "ro/r.ini", fs::perms(0666));
  fs::permissions(dir.path() / "ro", fs::perms(0555));
  const auto writeDenied = [&] {
    return !Set(u"s", u"k", u"2", inside.c_str()) && GetLastError() == ERROR_ACCESS_DENIED;
  };
  if (geteuid() != 0) {
    EXPECT_TRUE(writeDenied());
  } else {
    fs::permissions(dir.path(), fs::perms(0755));  // the child must reach the folder
    const pid_t child = fork();
    if (child == 0) _exit(setgid(65534) == 0 && setuid(65534) == 0 && writeDenied() ? 0 : 1);
    int status = 0;
    waitpid(child, &status, 0);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
  }
  EXPECT_EQ(Bytes(dir, "ro/r.ini"), original);
  fs::permissions(dir.path() / "ro", fs::perms::owner_all);
}

// A system call failing at each step of the replacement: the old file stays whole and no
// temporary file is left behind.
TEST(ProfileWrite, FailedSystemCallsLoseNothing) {
  TempDir dir;
  const std::string original = "[s]\r\nk=1\r\n";
  const std::u16string path = dir.Write("f.ini", original);
  const struct {
    const char* name;
    std::function<void(sys::SyscallTable&)> inject;
    DWORD error;
  } rows[] = {
      {"WriteDiskFull", [](sys::SyscallTable& t) {
         t.write = [](int, const void*, size_t) -> ssize_t { errno = ENOSPC; return -1; };
       }, ERROR_DISK_FULL},
      {"FsyncFails", [](sys::SyscallTable& t) {
         t.fsync = [](int) { errno = EIO; return -1; };
       }, ErrorFromErrno(EIO)},
      {"RenameDenied", [](sys::SyscallTable& t) {
         t.rename = [](const char*, const char*) { errno = EACCES; return -1; };
       }, ERROR_ACCESS_DENIED},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.name);
    {
      sys::ScopedSyscalls scoped;
      row.inject(scoped.table());
      EXPECT_FALSE(Set(u"s", u"k", u"2", path.c_str()));
      EXPECT_EQ(GetLastError(), row.error);
    }
    EXPECT_EQ(Bytes(dir, "f.ini"), original);
    EXPECT_EQ(FilesIn(dir.path()), 1u);
    EXPECT_EQ(Value(u"s", u"k", path), u"1");
  }
}

// A link stays a link, and the file keeps its permissions.
TEST(ProfileWrite, KeepsLinksAndPermissions) {
  TempDir dir;
  fs::create_directory(dir.path() / "real");
  dir.Write("real/t.ini", "[s]\nk=1\n");
  fs::permissions(dir.path() / "real/t.ini", fs::perms(0640));
  const std::string target = (dir.path() / "real/t.ini").string();
  const bool superuser = geteuid() == 0;  // may give the file to another owner
  if (superuser) {
    ASSERT_EQ(chown(target.c_str(), 65534, 65534), 0);
  }
  fs::create_symlink("real/t.ini", dir.path() / "link.ini");
  const std::u16string link = dir.File("link.ini");
  ASSERT_TRUE(Set(u"s", u"k", u"2", link.c_str()));
  EXPECT_TRUE(fs::is_symlink(dir.path() / "link.ini"));
  EXPECT_EQ(Bytes(dir, "real/t.ini"), "[s]\nk=2\n");
  EXPECT_EQ(fs::status(target).permissions(), fs::perms(0640));
  struct stat info {};
  stat(target.c_str(), &info);
  if (superuser) {
    EXPECT_TRUE(info.st_uid == 65534 && info.st_gid == 65534);
  }
  EXPECT_EQ(Value(u"s", u"k", dir.File("real/t.ini")), u"2");
  EXPECT_EQ(FilesIn(dir.path() / "real"), 1u);
}

// Bare names live in the Windows folder's stand-in; a null name is win.ini there.
TEST(ProfileWrite, BareNamesGoToTheWindowsFolder) {
  TempDir dir;
  const std::string windows = (dir.path() / "home/windows").string();
  ScopedEnv folder("TAVLO_PLATFORM_WINDIR", windows.c_str());
  ASSERT_TRUE(Set(u"s", u"k", u"bare", u"app.ini"));
  EXPECT_EQ(Bytes(dir, "home/windows/app.ini"), "[s]\r\nk=bare\r\n");
  EXPECT_EQ(Value(u"s", u"k", u"app.ini"), u"bare");
  ASSERT_TRUE(Set(u"s", u"k", u"win", nullptr));
  EXPECT_EQ(Bytes(dir, "home/windows/win.ini"), "[s]\r\nk=win\r\n");
  EXPECT_EQ(GetPrivateProfileIntW(u"s", u"missing", 3, nullptr), 3u);
  EXPECT_EQ(Value(u"s", u"k", u".\\app.ini"), u"<default>") << "a folder in the name: used as given";
}
