// Opening binary streams by name: the mode letters, what each mode does to a missing and to an
// existing file, the system message of a failed open, sharing, deletion on close, and the base
// copy the host is asked to keep before a file is changed.

#include <gtest/gtest.h>

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "files/binary_stream_test_support.h"
#include "support/temp_dir.h"
#include "support/test_host.h"
#include "vynutil/path.h"

namespace {

using VynSDK::Util::BinaryStream;
using VynSDK::Util::VynString;
using vyn::test::FileContents;
using vyn::test::StreamPtr;
using vyn::test::TextOf;
namespace fs = std::filesystem;

// System messages of the Win32 error codes (System Error Codes reference).
constexpr char16_t kFileNotFound[] = u"The system cannot find the file specified.\r\n";  // 2
constexpr char16_t kAccessDenied[] = u"Access is denied.\r\n";                          // 5
constexpr char16_t kSharingViolation[] =
    u"The process cannot access the file because it is being used by another process.\r\n";  // 32

StreamPtr Open(const std::u16string& path, unsigned mode, VynString* error = nullptr) {
  return StreamPtr(BinaryStream::FromFilename(vyn::test::StringOf(path), mode, error));
}
unsigned Mode(const MCHAR* letters) { return BinaryStream::ParseStreamMode(letters); }

// A host that notes, at each request for a base copy, what the watched file held then.
struct WatchingHost : vyn::test::TestHost {
  bool SaveBaseFile(const MCHAR* path) override {
    seen.push_back(fs::exists(watched) ? std::optional(FileContents(watched)) : std::nullopt);
    return TestHost::SaveBaseFile(path);
  }
  fs::path watched;
  std::vector<std::optional<std::string>> seen;
};

}  // namespace

TEST(BinaryStreamOpen, ParseStreamModeTable) {
  const struct {
    const char16_t* mode;
    unsigned flags;
  } rows[] = {
      {u"rb", 0x41}, {u"w+", 0x3B}, {u"a", 0x36}, {u"x", 0}, {u"", 0x20},  // the documented examples
      {u"r+", 0x23}, {u"rw", 0x23}, {u"a+", 0x37}, {u"rbt", 0x21}, {u"rcn", 0x21}, {u"rce", 0x1A1},
      {u"wTD", 0x63A}, {u"rSR", 0x1021}, {u"rRS", 0x821}, {u"rN", 0x21},
      {u"rb+", 0},  // '+' counts only right after r, w or a
      {u"w, ccs=UTF-8", 0},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(Mode(row.mode), row.flags) << fs::path(std::u16string(row.mode)).string();
  }
  EXPECT_EQ(Mode(nullptr), 0x20u);
}

TEST(BinaryStreamOpen, ModesOnMissingAndExistingFiles) {
  // Creation as CreateFileW's dispositions give it (OPEN_EXISTING, OPEN_ALWAYS, CREATE_ALWAYS,
  // TRUNCATE_EXISTING), then a read from the start and a write at the end.
  const struct {
    const char* what;
    unsigned mode;
    bool exists;
    const char* after;  // contents after opening; null: the open fails
    const char16_t* error;
    bool reads;
    bool writes;
  } rows[] = {
      {"r, missing", 0x21, false, nullptr, kFileNotFound, false, false},
      {"r, existing", 0x21, true, "old", nullptr, true, false},
      {"r+, existing", 0x23, true, "old", nullptr, true, true},
      {"w, missing", 0x3A, false, "", nullptr, false, true},
      {"w+, existing", 0x3B, true, "", nullptr, true, true},
      {"a, existing", 0x36, true, "old", nullptr, true, true},
      // The modes of the bool form: write 0x13, truncate 0x9, both 0x1B.
      {"write, missing", 0x13, false, "", nullptr, true, true},
      {"write, existing", 0x13, true, "old", nullptr, true, true},
      {"truncate, existing", 0x9, true, "", nullptr, true, true},
      {"truncate, missing", 0x9, false, nullptr, kFileNotFound, false, false},
      {"write and truncate, existing", 0x1B, true, "", nullptr, true, true},
  };
  vyn::test::TempDir dir;
  int n = 0;
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    const std::string name = "file" + std::to_string(n++);
    const std::u16string path = row.exists ? dir.Write(name, "old") : dir.File(name);
    VynString error;
    StreamPtr stream = Open(path, row.mode, &error);
    EXPECT_EQ(TextOf(error), row.error ? row.error : u"");
    ASSERT_EQ(stream != nullptr, row.after != nullptr);
    if (stream == nullptr) continue;
    EXPECT_EQ(vyn::test::ReadText(*stream, 10), row.reads ? row.after : "");
    stream->Seek(0, 2);
    EXPECT_EQ(vyn::test::WriteText(*stream, "new"), row.writes ? 3u : 0u);
    stream.reset();
    EXPECT_EQ(FileContents(dir.path() / name), std::string(row.after) + (row.writes ? "new" : ""));
  }
  // A read-only file (no write permission for its owner) refuses writers, root included.
  const std::u16string locked = dir.Write("locked", "keep");
  fs::permissions(dir.path() / "locked", fs::perms::owner_read);
  for (unsigned mode : {Mode(u"r+"), Mode(u"w"), 0x401u}) {
    VynString error;
    EXPECT_EQ(Open(locked, mode, &error), nullptr);
    EXPECT_EQ(TextOf(error), kAccessDenied) << "mode " << mode;
  }
  EXPECT_EQ(FileContents(dir.path() / "locked"), "keep");
}

TEST(BinaryStreamOpen, SharingAndDeletionOnClose) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("shared", "data");
  VynString error;
  {
    StreamPtr reader = Open(path, Mode(u"r"));
    EXPECT_NE(Open(path, Mode(u"r")), nullptr) << "readers share with readers";
    EXPECT_EQ(Open(path, Mode(u"r+"), &error), nullptr) << "but not with writers";
    EXPECT_EQ(TextOf(error), kSharingViolation);
  }
  {
    StreamPtr exclusive = Open(path, Mode(u"re"));
    EXPECT_EQ(Open(path, Mode(u"r")), nullptr);
  }
  for (const char16_t* mode : {u"w+bTD", u"w+cSD", u"w+RD"}) {
    StreamPtr scratch = Open(dir.File("scratch"), Mode(mode));
    ASSERT_NE(scratch, nullptr);
    EXPECT_EQ(vyn::test::WriteText(*scratch, "scratch"), 7u);
    EXPECT_TRUE(fs::exists(dir.path() / "scratch"));
    scratch.reset();
    EXPECT_FALSE(fs::exists(dir.path() / "scratch"));
  }
}

TEST(BinaryStreamOpen, HostKeepsABaseCopyBeforeTheFileChanges) {
  vyn::test::TempDir dir;
  const struct {
    const char16_t* mode;
    bool asked;
  } rows[] = {{u"r", false}, {u"r+", true}, {u"w", true}, {u"a", true}, {u"wT", false}, {u"wD", false}};
  int n = 0;
  for (const auto& row : rows) {
    SCOPED_TRACE(fs::path(std::u16string(row.mode)).string());
    WatchingHost host;
    const std::string name = "base" + std::to_string(n++);
    host.watched = dir.path() / name;
    const std::u16string path = dir.Write(name, "before");
    ASSERT_NE(Open(path, Mode(row.mode)), nullptr);
    ASSERT_EQ(host.saved_base_files.size(), row.asked ? 1u : 0u);
    if (!row.asked) continue;
    EXPECT_EQ(host.saved_base_files[0], VynSDK::Util::Path(path.c_str()).GetCStr());
    EXPECT_EQ(host.seen[0], std::optional<std::string>("before")) << "asked before the file is opened";
  }
  WatchingHost host;  // a file about to be created is asked about too
  ASSERT_NE(Open(dir.File("new"), 0x9 | 0x10), nullptr);
  EXPECT_EQ(host.saved_base_files.size(), 1u) << "truncating changes the file as writing does";
}
