// Mapped network drives: their configuration, what paths on them reach, drive types, and the
// enumeration of connected drives with the caller's buffer sizes.

#include "win32/network_drives.h"

#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>
#include <string>
#include <vector>

#include "file_test_helpers.h"
#include "scoped_env.h"
#include "support/temp_dir.h"
#include "win32/file_handle.h"
#include "win32/last_error.h"
#include "win32/path_map.h"

namespace {

using namespace win32;
namespace fs = std::filesystem;

// Every letter explicitly not a network drive for the scope, whatever the environment says,
// and all of them back to the environment afterwards.
class NoNetworkDrives {
 public:
  NoNetworkDrives() {
    for (MCHAR letter = u'A'; letter <= u'Z'; ++letter) SetMappedNetworkDrive(letter, u"");
  }
  ~NoNetworkDrives() {
    for (MCHAR letter = u'A'; letter <= u'Z'; ++letter) SetMappedNetworkDrive(letter, nullptr);
  }
};

struct Entry {
  std::u16string local, remote;
  bool operator==(const Entry&) const = default;
};

// The entries of one WNetEnumResourceW call, checking that their strings lie inside the buffer.
std::vector<Entry> Entries(const std::vector<unsigned char>& buffer, DWORD count) {
  std::vector<Entry> entries;
  const unsigned char* begin = buffer.data();
  const unsigned char* end = begin + buffer.size();
  for (DWORD i = 0; i < count; ++i) {
    NETRESOURCEW record;
    std::memcpy(&record, begin + i * sizeof record, sizeof record);
    EXPECT_EQ(record.dwScope, RESOURCE_CONNECTED);
    EXPECT_EQ(record.dwType, RESOURCETYPE_DISK);
    for (const MCHAR* text : {record.lpLocalName, record.lpRemoteName}) {
      const auto* at = reinterpret_cast<const unsigned char*>(text);
      EXPECT_TRUE(at >= begin + count * sizeof record && at < end) << "strings live in the buffer";
    }
    entries.push_back({record.lpLocalName, record.lpRemoteName});
  }
  return entries;
}

}  // namespace

TEST(NetworkDrives, ConfigurationTakesOnlyShareNames) {
  NoNetworkDrives none;
  const struct {
    MCHAR letter;
    const char16_t* name;
    bool taken;
  } rows[] = {
      {u'N', u"\\\\server\\share", true}, {u'n', u"\\\\server\\share\\", true},
      {u'N', u"\\\\server", false},       {u'N', u"\\\\server\\share\\dir", false},
      {u'N', u"C:\\share", false},        {u'N', u"\\\\\\share", false},
      {u'1', u"\\\\server\\share", false}, {u'N', u"//server/share", false},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(testing::PrintToString(std::u16string(row.name)));
    EXPECT_EQ(SetMappedNetworkDrive(row.letter, row.name), row.taken);
  }
  // The environment names drives too; the setter's word wins, and null returns to it.
  ScopedEnv variable("TAVLO_PLATFORM_NETDRIVE_Q", "\\\\filer\\projects");
  EXPECT_EQ(GetDriveTypeW(u"Q:\\"), DRIVE_FIXED) << "set to no network drive above";
  SetMappedNetworkDrive(u'Q', nullptr);
  EXPECT_EQ(GetDriveTypeW(u"Q:\\"), DRIVE_REMOTE);
  EXPECT_EQ(GetDriveTypeW(u"q:"), DRIVE_REMOTE);
}

TEST(NetworkDrives, PathsOnADriveReachItsShare) {
  NoNetworkDrives none;
  vyn::test::TempDir dir;
  SetUncRoot(dir.path().c_str());
  ASSERT_TRUE(SetMappedNetworkDrive(u'N', u"\\\\server\\share"));
  EXPECT_EQ(MapPath(u"N:\\dir\\f.txt"), (dir.path() / "server/share/dir/f.txt").string());
  EXPECT_EQ(MapPath(u"n:"), (dir.path() / "server/share").string());
  fs::create_directories(dir.path() / "server/share");
  {
    vyn::test::ScopedHandle file(vyn::test::OpenFile(u"N:\\on-share.txt", GENERIC_WRITE, 0, CREATE_NEW));
    ASSERT_TRUE(file.valid());
  }
  EXPECT_TRUE(fs::exists(dir.path() / "server/share/on-share.txt"));
  SetUncRoot(nullptr);
}

TEST(NetworkDrives, DriveTypes) {
  NoNetworkDrives none;
  vyn::test::TempDir dir;
  ASSERT_TRUE(SetMappedNetworkDrive(u'N', u"\\\\server\\share"));
  SetDriveRoot(u'T', dir.path().c_str());
  SetDriveRoot(u'U', (dir.path() / "missing").c_str());
  // GetDriveTypeW documentation: the root of a drive, with its trailing backslash.
  const struct {
    const char16_t* root;
    UINT type;
  } rows[] = {
      {u"N:\\", DRIVE_REMOTE},         {u"T:\\", DRIVE_FIXED},        {u"t:/", DRIVE_FIXED},
      {u"U:\\", DRIVE_NO_ROOT_DIR},    {u"\\\\srv\\data\\", DRIVE_REMOTE}, {u"\\", DRIVE_FIXED},
      {u"T:\\folder\\", DRIVE_NO_ROOT_DIR}, {u"", DRIVE_NO_ROOT_DIR},
      {nullptr, DRIVE_FIXED},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.root != nullptr ? testing::PrintToString(std::u16string(row.root)) : "(null)");
    EXPECT_EQ(GetDriveTypeW(row.root), row.type);
  }
  SetDriveRoot(u'T', nullptr);
  SetDriveRoot(u'U', nullptr);
}

TEST(NetworkDrives, EnumerationFillsTheCallersBuffer) {
  NoNetworkDrives none;
  ASSERT_TRUE(SetMappedNetworkDrive(u'X', u"\\\\s3\\c"));
  ASSERT_TRUE(SetMappedNetworkDrive(u'G', u"\\\\server\\share"));
  ASSERT_TRUE(SetMappedNetworkDrive(u'm', u"\\\\filer\\media"));
  const std::vector<Entry> all = {
      {u"G:", u"\\\\server\\share"}, {u"M:", u"\\\\filer\\media"}, {u"X:", u"\\\\s3\\c"}};

  HANDLE listing = nullptr;
  ASSERT_EQ(WNetOpenEnumW(RESOURCE_CONNECTED, RESOURCETYPE_DISK, 0, nullptr, &listing), NO_ERROR);
  std::vector<unsigned char> buffer(2400);
  DWORD count = 0xFFFFFFFF, size = 2400;
  ASSERT_EQ(WNetEnumResourceW(listing, &count, buffer.data(), &size), NO_ERROR);
  EXPECT_EQ(Entries(buffer, count), all);
  count = 0xFFFFFFFF;
  EXPECT_EQ(WNetEnumResourceW(listing, &count, buffer.data(), &size), ERROR_NO_MORE_ITEMS);
  EXPECT_EQ(count, 0u);
  EXPECT_EQ(WNetCloseEnum(listing), NO_ERROR);
  EXPECT_EQ(WNetCloseEnum(listing), ERROR_INVALID_HANDLE);

  // A buffer too small for one entry: ERROR_MORE_DATA and the exact size the entry needs.
  ASSERT_EQ(WNetOpenEnumW(RESOURCE_CONNECTED, RESOURCETYPE_ANY, 0, nullptr, &listing), NO_ERROR);
  const DWORD firstNeeds = sizeof(NETRESOURCEW) + (3 + 15) * sizeof(MCHAR);
  count = 0xFFFFFFFF;
  size = 16;
  EXPECT_EQ(WNetEnumResourceW(listing, &count, buffer.data(), &size), ERROR_MORE_DATA);
  EXPECT_EQ(size, firstNeeds);
  buffer.assign(firstNeeds, 0);
  EXPECT_EQ(WNetEnumResourceW(listing, &count, buffer.data(), &size), NO_ERROR);
  EXPECT_EQ(Entries(buffer, count), std::vector<Entry>(all.begin(), all.begin() + 1));
  // A count asks for at most that many.
  buffer.assign(2400, 0);
  count = 1;
  size = 2400;
  EXPECT_EQ(WNetEnumResourceW(listing, &count, buffer.data(), &size), NO_ERROR);
  EXPECT_EQ(Entries(buffer, count), std::vector<Entry>(all.begin() + 1, all.begin() + 2));
  EXPECT_EQ(WNetCloseEnum(listing), NO_ERROR);

  EXPECT_EQ(WNetOpenEnumW(2, RESOURCETYPE_DISK, 0, nullptr, &listing), ERROR_NOT_SUPPORTED);
  EXPECT_EQ(WNetEnumResourceW(reinterpret_cast<HANDLE>(0x40), &count, buffer.data(), &size),
            ERROR_INVALID_HANDLE);
  EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
}
