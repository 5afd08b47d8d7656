// Existence tests: the file system with the cloud-storage rules, the host's missing-path cache,
// timing logs, and the UNC form of mapped drives.

#include <gtest/gtest.h>

#include <QString>
#include <filesystem>
#include <regex>
#include <string>
#include <vector>

#include "support/child_process.h"
#include "support/temp_dir.h"
#include "support/test_host.h"
#include "vynutil/file_exists.h"
#include "win32/file_attributes.h"
#include "win32/network_drives.h"

namespace {

using win32::FILE_ATTRIBUTE_ARCHIVE;
using win32::FILE_ATTRIBUTE_OFFLINE;
using win32::FILE_ATTRIBUTE_READONLY;

// A host cache that answers from its own list and records the questions.
class RecordingCache : public IMissingPathCache {
 public:
  bool FileExists(const MCHAR* path, bool acceptDirectories) override {
    questions.push_back(std::u16string(u"file:") + path + (acceptDirectories ? u"+dirs" : u""));
    return answer;
  }
  bool DirectoryExists(const MCHAR* path) override {
    questions.push_back(std::u16string(u"dir:") + path);
    return answer;
  }
  bool answer = true;
  std::vector<std::u16string> questions;
};

struct ScopedOverrides {
  ~ScopedOverrides() { win32::detail::ClearExtraFileAttributes(); }
};

}  // namespace

TEST(FileExists, FileSystemTestsWithCloudStorageRules) {
  vyn::test::TempDir dir;
  ScopedOverrides overrides;
  const std::u16string file = dir.Write("plain.txt", "x");
  const std::u16string folder = dir.path().u16string();
  EXPECT_TRUE(UtilFileExists(file.c_str(), false));
  EXPECT_FALSE(UtilFileExists(folder.c_str(), false));
  EXPECT_TRUE(UtilFileExists(folder.c_str(), true));
  EXPECT_FALSE(UtilFileExists(dir.File("missing").c_str(), true));
  EXPECT_FALSE(UtilFileExists(nullptr, true));
  EXPECT_TRUE(UtilDirectoryExists(folder.c_str()));
  EXPECT_FALSE(UtilDirectoryExists(file.c_str()));

  // Kept online only: offline without archive is absent, and not available.
  const std::u16string online = dir.Write("online.txt", "x");
  win32::detail::SetExtraFileAttributes(online.c_str(), FILE_ATTRIBUTE_OFFLINE);
  bool available = true;
  EXPECT_FALSE(UtilFileExists_NoMissingPathCache(online.c_str(), true, &available));
  EXPECT_FALSE(available);
  EXPECT_TRUE(UtilDirectoryExists_NoMissingPathCache(folder.c_str(), &available));
  EXPECT_TRUE(available);

  // Offline and archived: present only under a read-only folder whose name holds "Dropbox".
  std::filesystem::create_directories(dir.path() / "MyDropboxFiles" / "sub");
  const std::u16string box = (dir.path() / "MyDropboxFiles").u16string();
  const std::u16string cloud = dir.Write("MyDropboxFiles/sub/cloud.txt", "x");
  win32::detail::SetExtraFileAttributes(cloud.c_str(), FILE_ATTRIBUTE_OFFLINE | FILE_ATTRIBUTE_ARCHIVE);
  EXPECT_FALSE(UtilFileExists_NoMissingPathCache(cloud.c_str(), true, &available));
  ASSERT_TRUE(win32::SetFileAttributesW(box.c_str(), FILE_ATTRIBUTE_READONLY));
  EXPECT_TRUE(UtilFileExists_NoMissingPathCache(cloud.c_str(), true, &available));
  EXPECT_TRUE(available);
  win32::SetFileAttributesW(box.c_str(), win32::FILE_ATTRIBUTE_NORMAL);
  // A placeholder that is fetched on access counts as present.
  win32::detail::SetExtraFileAttributes(online.c_str(),
                                        FILE_ATTRIBUTE_OFFLINE | win32::FILE_ATTRIBUTE_RECALL_ON_DATA_ACCESS);
  EXPECT_TRUE(UtilFileExists(online.c_str(), false));
}

TEST(FileExists, TheHostsCacheAnswersWhileTheHostIsRegistered) {
  static RecordingCache cache;  // kept by the library once found, so it lives with the process
  vyn::test::TestHost host;
  host.interfaces[{MISSING_PATH_CACHE_INTERFACE_ID.PartA(), MISSING_PATH_CACHE_INTERFACE_ID.PartB()}] = &cache;
  cache.answer = false;
  EXPECT_FALSE(UtilFileExists(u"/", true));
  EXPECT_FALSE(UtilDirectoryExists(u"/"));
  EXPECT_EQ(cache.questions, (std::vector<std::u16string>{u"file:/+dirs", u"dir:/"}));
  host.interfaces.clear();
  EXPECT_FALSE(UtilFileExists(u"/", true));  // kept, not asked again
  EXPECT_EQ(host.interface_requests.size(), 2u);
}

TEST(FileExists, LoggingReportsEveryDirectTestWithItsDuration) {
  if (!vyn::test::InChildProcess()) {
    EXPECT_TRUE(vyn::test::RunCurrentTestInChild({{"KORV_TAVLO_2015_UtilFileExistsLogging", "1"}}));
    return;
  }
  vyn::test::TestHost host;
  UtilFileExists_NoMissingPathCache(u"/", true, nullptr);
  UtilDirectoryExists_NoMissingPathCache(u"/nonexistent-folder", nullptr);
  ASSERT_EQ(host.log.size(), 2u);
  EXPECT_EQ(host.log[0].type, SYSLOG_DEBUG);
  EXPECT_EQ(host.log[0].dialogue, NO_DIALOG);
  EXPECT_EQ(host.log[0].title, u"");
  const std::string first = QString::fromStdU16String(host.log[0].text).toStdString();
  const std::string second = QString::fromStdU16String(host.log[1].text).toStdString();
  EXPECT_TRUE(std::regex_match(first, std::regex("DoesFileExist: File: /; res: 1; t: [0-9]+\\.[0-9][0-9] ms; tid: [0-9A-F]+"))) << first;
  EXPECT_TRUE(std::regex_search(second, std::regex("^DoesDirectoryExist: Directory: /nonexistent-folder; res: 0; t: "))) << second;
  host.offers_log = false;
  UtilFileExists_NoMissingPathCache(u"/", true, nullptr);  // no log object: nothing, no crash
}

TEST(FileExists, UniversalNamesOfMappedDrives) {
  // Long share names make the listing overflow the first buffer.
  std::vector<std::u16string> shares;
  for (MCHAR letter = u'M'; letter <= u'Z'; ++letter) {
    shares.push_back(u"\\\\server-with-a-long-name\\share-" + std::u16string(60, letter));
    ASSERT_TRUE(win32::SetMappedNetworkDrive(letter, shares.back().c_str()));
  }
  WStr out(u"stale");
  EXPECT_EQ(UtilGetUniversalFilename(out, u"q:\\models\\a.max"), 1);
  EXPECT_EQ(std::u16string(out.data()), shares[u'Q' - u'M'] + u"\\models\\a.max");
  // The last drive comes in a later batch of the listing.
  EXPECT_EQ(UtilGetUniversalFilename(out, u"Z:\\x"), 1);
  EXPECT_EQ(std::u16string(out.data()), shares.back() + u"\\x");
  for (const MCHAR* path : {u"C:\\models", u"\\\\srv\\share\\a", u"Q:", u"relative", u"7:\\x"}) {
    out = u"stale";
    EXPECT_EQ(UtilGetUniversalFilename(out, path), 0);
    EXPECT_EQ(out.Length(), 0);
  }
  for (MCHAR letter = u'M'; letter <= u'Z'; ++letter) win32::SetMappedNetworkDrive(letter, nullptr);

  SetResolveUNC(3);
  SetResolveToRelative(4);
  EXPECT_EQ(GetResolveUNC(), 3);
  EXPECT_EQ(GetResolveToRelative(), 4);
}
