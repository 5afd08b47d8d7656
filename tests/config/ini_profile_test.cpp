// The library's INI functions on real files: encodings, folder creation, growing buffers, and
// several processes writing one file at once.

#include <gtest/gtest.h>
#include <signal.h>
#include <unistd.h>

#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "support/child_process.h"
#include "support/temp_dir.h"
#include "vynutil/ini_profile.h"
#include "vynutil/mutex.h"

namespace {

namespace fs = std::filesystem;
using namespace VynSDK::Util;

std::string Bytes(const fs::path& file) {
  std::ifstream in(file, std::ios::binary);
  std::stringstream all;
  all << in.rdbuf();
  return all.str();
}

// Temporary copies the INI functions leave in the temporary folder ("INI" prefix).
std::size_t LeftoverCopies() {
  std::size_t count = 0;
  const char* tmp = std::getenv("TMPDIR");
  for (const auto& entry : fs::directory_iterator(tmp != nullptr ? tmp : "/tmp")) {
    if (entry.path().filename().string().rfind("INI", 0) == 0) ++count;
  }
  return count;
}

std::u16string U16(const std::string& text) { return std::u16string(text.begin(), text.end()); }

TEST(IniProfile, Utf8FilesAreReadWithoutBeingChanged) {
  vyn::test::TempDir dir;
  const std::string text = "[Größe]\r\nbreite=12\r\nname=Ærø \xE6\x97\xA5\r\ndata=010203040A\r\n[Zwei]\r\nk=v\r\n";
  const std::u16string file = dir.Write("utf8.ini", text);
  const std::size_t before = LeftoverCopies();

  EXPECT_EQ(GetPrivateProfileIntW(u"größe", u"Breite", 5, file.c_str()), 12u);
  MCHAR buffer[64];
  EXPECT_EQ(GetPrivateProfileStringW(u"Größe", u"name", u"", buffer, 64, file.c_str()), 5u);
  EXPECT_EQ(std::u16string(buffer), u"Ærø \u65e5");
  unsigned char data[4] = {};
  EXPECT_TRUE(GetPrivateProfileStructW(u"Größe", u"data", data, 4, file.c_str()));
  EXPECT_EQ(data[3], 4);
  VynSDK::Array<MCHAR> names;
  EXPECT_EQ(GetPrivateProfileSectionNamesW(names, file.c_str()), 11u);
  EXPECT_EQ(std::u16string(names.Addr(), 11), std::u16string(u"Größe\0Zwei\0", 11));
  EXPECT_EQ(GetPrivateProfileSectionW(u"Zwei", buffer, 64, file.c_str()), 4u);
  EXPECT_EQ(Bytes(dir.path() / "utf8.ini"), text) << "reading changes nothing";
  EXPECT_EQ(LeftoverCopies(), before) << "no temporary copy is left";
}

TEST(IniProfile, WritesCreateFoldersAndTurnFilesIntoUtf16) {
  vyn::test::TempDir dir;
  const std::u16string fresh = dir.File("a/b/new.ini");
  ASSERT_TRUE(WritePrivateProfileStringW(u"S", u"k", u"v", fresh.c_str()));
  EXPECT_EQ(Bytes(dir.path() / "a/b/new.ini").substr(0, 2), "\xFF\xFE");

  const std::u16string utf8 = dir.Write("old.ini", "[S]\nname=caf\xC3\xA9\nother=1\n");
  ASSERT_TRUE(WritePrivateProfileStringW(u"S", u"added", u"\u00e9t\u00e9", utf8.c_str()));
  EXPECT_EQ(Bytes(dir.path() / "old.ini").substr(0, 2), "\xFF\xFE");
  MCHAR buffer[32];
  GetPrivateProfileStringW(u"S", u"name", u"", buffer, 32, utf8.c_str());
  EXPECT_EQ(std::u16string(buffer), u"caf\u00e9") << "other keys keep their text";
  GetPrivateProfileStringW(u"S", u"added", u"", buffer, 32, utf8.c_str());
  EXPECT_EQ(std::u16string(buffer), u"\u00e9t\u00e9");

  // A folder that cannot be made: nothing written, failure returned.
  dir.Write("blocker", "x");
  EXPECT_FALSE(WritePrivateProfileStringW(u"S", u"k", u"v", dir.File("blocker/sub/x.ini").c_str()));
}

TEST(IniProfile, GrowingBuffersHoldTheWholeText) {
  vyn::test::TempDir dir;
  const std::u16string file = dir.File("big.ini");
  const std::u16string value(511, u'v');
  ASSERT_TRUE(WritePrivateProfileStringW(u"S", u"exact", value.c_str(), file.c_str()));
  VynSDK::Array<MCHAR> out;
  EXPECT_EQ(GetPrivateProfileStringW(u"S", u"exact", u"", out, file.c_str()), 511u)
      << "size - 1 looks cut: read again with 1024";
  EXPECT_EQ(out.Length(), 512u);
  EXPECT_EQ(std::u16string(out.Addr()), value);

  const std::u16string section = u"k=" + std::u16string(596, u's');  // 598 units + 2 nulls
  ASSERT_TRUE(WritePrivateProfileSectionW(u"Long", std::u16string(section + u'\0').c_str(), file.c_str()));
  EXPECT_EQ(GetPrivateProfileSectionW(u"Long", out, file.c_str()), 599u);
  EXPECT_EQ(out.Length(), 600u);
  EXPECT_EQ(GetPrivateProfileStringW(u"Missing", u"k", u"dflt", out, file.c_str()), 4u);
  EXPECT_EQ(out.Length(), 5u);
}

// Each child adds its own 200 keys; every key of every process must be there afterwards.
TEST(IniProfile, EightProcessesWritingOneFile) {
  constexpr int kProcesses = 8;
  constexpr int kKeys = 200;
  if (vyn::test::InChildProcess()) {
    const std::u16string file = U16(std::getenv("VYN_INI_FILE"));
    const std::string who = std::getenv("VYN_INI_WRITER");
    for (int i = 0; i < kKeys; ++i) {
      const std::u16string key = U16("p" + who + "k" + std::to_string(i));
      ASSERT_TRUE(WritePrivateProfileStringW(u"Shared", key.c_str(), key.c_str(), file.c_str()));
    }
    return;
  }
  vyn::test::TempDir dir;
  for (const std::string& start : {std::string("\xFF\xFE[\0S\0]\0\r\0\n\0", 12), std::string("[S]\r\nx=\xC3\xA9\r\n")}) {
    const std::u16string file = dir.Write("shared.ini", start);
    std::vector<std::thread> runners;
    for (int p = 0; p < kProcesses; ++p) {
      runners.emplace_back([&, p] {
        EXPECT_TRUE(vyn::test::RunCurrentTestInChild(
            {{"VYN_INI_FILE", (dir.path() / "shared.ini").string()}, {"VYN_INI_WRITER", std::to_string(p)}}));
      });
    }
    for (std::thread& runner : runners) runner.join();
    VynSDK::Array<MCHAR> keys;
    GetPrivateProfileStringW(u"Shared", nullptr, u"", keys, file.c_str());
    std::size_t count = 0;
    for (const MCHAR* at = keys.Addr(); *at != 0; at += std::char_traits<char16_t>::length(at) + 1) ++count;
    EXPECT_EQ(count, static_cast<std::size_t>(kProcesses * kKeys));
  }
}

// A writer killed in the middle of its writes leaves a file that reads, and no lock behind.
TEST(IniProfile, AWriterKilledMidWayLeavesAReadableFile) {
  if (vyn::test::InChildProcess()) {
    const std::u16string file = U16(std::getenv("VYN_INI_FILE"));
    for (int i = 0;; ++i) {
      const std::u16string key = U16("k" + std::to_string(i % 500));
      WritePrivateProfileStringW(u"Busy", key.c_str(), std::u16string(200, u'x').c_str(), file.c_str());
    }
  }
  vyn::test::TempDir dir;
  const std::u16string file = dir.File("busy.ini");
  const int pid = vyn::test::StartCurrentTestInChild({{"VYN_INI_FILE", (dir.path() / "busy.ini").string()}});
  ASSERT_GT(pid, 0);
  std::this_thread::sleep_for(std::chrono::milliseconds(400));
  kill(pid, SIGKILL);
  EXPECT_EQ(vyn::test::WaitForChild(pid), 128 + SIGKILL);

  FileMutexObject next(file.c_str(), 3000);
  EXPECT_TRUE(next.MutexAquired()) << "the dead writer's mutex does not block the next process";
  next.ReleaseMutex();
  const std::string bytes = Bytes(dir.path() / "busy.ini");
  ASSERT_GE(bytes.size(), 2u);
  EXPECT_EQ(bytes.substr(0, 2), "\xFF\xFE");
  VynSDK::Array<MCHAR> keys;
  GetPrivateProfileStringW(u"Busy", nullptr, u"", keys, file.c_str());
  MCHAR value[256];
  for (const MCHAR* at = keys.Addr(); *at != 0; at += std::char_traits<char16_t>::length(at) + 1) {
    EXPECT_EQ(GetPrivateProfileStringW(u"Busy", at, u"", value, 256, file.c_str()), 200u) << "no torn value";
  }
}

}  // namespace
