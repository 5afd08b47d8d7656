// Binary streams over runtime FILE*s: failures reported through LastError() as the runtime's
// errno texts (glibc's strerror wording): refused calls, seeks failed through the platform's
// system-call table, a full device and a process file-size limit, which must not end the process.

#include <gtest/gtest.h>

#include <signal.h>
#include <sys/resource.h>

#include <cerrno>
#include <cstdio>
#include <functional>
#include <string>

#include "files/binary_stream_test_support.h"
#include "support/child_process.h"
#include "support/temp_dir.h"
#include "syscalls.h"

namespace {

using VynSDK::Util::BinaryStream;
using vyn::test::ReadText;
using vyn::test::StreamPtr;
using vyn::test::TextOf;
using vyn::test::WriteText;

StreamPtr Open(const std::filesystem::path& path, const char* mode) {
  return StreamPtr(BinaryStream::FromFile(std::fopen(path.c_str(), mode), true));
}

std::u16string ErrnoText(int error) { return TextOf(VynSDK::Util::VynString::FromAnsiError(error)); }

}  // namespace

TEST(BinaryStreamFile, RefusedCallsLeaveTheirErrnoText) {
  EXPECT_EQ(BinaryStream::FromFile(nullptr, true), nullptr);
  vyn::test::TempDir dir;
  dir.Write("data", "0123456789");
  const struct {
    const char* what;
    std::function<void(BinaryStream&)> call;
    int error;
  } rows[] = {
      {"a write to a FILE* opened for reading",
       [](BinaryStream& s) { EXPECT_EQ(WriteText(s, "abc"), 0u); }, EBADF},
      {"a truncation without write access", [](BinaryStream& s) { s.Truncate(); }, EBADF},
      {"a seek before the start", [](BinaryStream& s) { EXPECT_EQ(s.Seek(-1, 0), -1); }, EINVAL},
      {"an unknown origin", [](BinaryStream& s) { EXPECT_EQ(s.Seek(0, 7), -1); }, EINVAL},
      {"a null read buffer", [](BinaryStream& s) { EXPECT_EQ(s.Read(nullptr, 4), 0u); }, EINVAL},
      {"a null write source", [](BinaryStream& s) { EXPECT_EQ(s.Write(nullptr, 4), 0u); }, EINVAL},
      {"a failed seek", [](BinaryStream& s) {
         win32::sys::ScopedSyscalls calls;
         calls.table().fseeko = [](FILE*, off_t, int) { errno = EIO; return -1; };
         EXPECT_EQ(s.Seek(1, 0), -1);
       }, EIO},
      {"a failed position query", [](BinaryStream& s) {
         win32::sys::ScopedSyscalls calls;
         calls.table().ftello = [](FILE*) -> off_t { errno = ESPIPE; return -1; };
         EXPECT_EQ(s.Seek(1, 0), -1);
       }, ESPIPE},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    StreamPtr stream = Open(dir.path() / "data", "rb");
    EXPECT_TRUE(stream->LastError().IsNull());
    row.call(*stream);
    EXPECT_EQ(TextOf(stream->LastError()), ErrnoText(row.error));
    EXPECT_EQ(stream->Seek(0, 0), 0) << "the stream goes on working";
    EXPECT_EQ(ReadText(*stream, 4), "0123");
  }
  EXPECT_EQ(vyn::test::FileContents(dir.path() / "data"), "0123456789");
}

TEST(BinaryStreamFile, AFullDeviceShowsInTheCountOrAtTheFlush) {
  // /dev/full takes no byte: every write fails with ENOSPC.
  StreamPtr buffered = Open("/dev/full", "wb");
  if (buffered == nullptr) GTEST_SKIP() << "no /dev/full";
  EXPECT_EQ(WriteText(*buffered, "abc"), 3u) << "the runtime's buffer takes it";
  EXPECT_TRUE(buffered->LastError().IsNull());
  buffered->Flush();
  EXPECT_EQ(TextOf(buffered->LastError()), ErrnoText(ENOSPC));
  StreamPtr direct = Open("/dev/full", "wb");
  EXPECT_EQ(WriteText(*direct, std::string(1 << 20, 'x')), 0u) << "larger than the buffer";
  EXPECT_EQ(TextOf(direct->LastError()), ErrnoText(ENOSPC));
}

TEST(BinaryStreamFile, FileSizeLimitFailsWritesWithoutEndingTheProcess) {
  if (!vyn::test::InChildProcess()) {
    // The limit, and the signal the kernel would send, stay in a child of this program.
    ASSERT_TRUE(vyn::test::RunCurrentTestInChild({}));
    return;
  }
  vyn::test::TempDir dir;
  const rlimit limit{1000, 1000};
  ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &limit), 0);
  // A write larger than the buffer reaches the file at once and comes back short; the stream
  // stops there rather than hand more to a runtime stream in error, which may drop it silently.
  StreamPtr stream = Open(dir.path() / "limited", "wb");
  EXPECT_EQ(WriteText(*stream, std::string(std::size_t{4} << 20, 'z')), 1000u);
  EXPECT_EQ(TextOf(stream->LastError()), ErrnoText(ENOSPC));
  // Extending a file beyond the limit: ENOSPC too, as the runtime reports a full disk.
  EXPECT_EQ(stream->Seek(5000, 0), 5000);
  stream->Truncate();
  EXPECT_EQ(TextOf(stream->LastError()), ErrnoText(ENOSPC));
  // A small write only fills the buffer; the failure shows when it is written out.
  stream = Open(dir.path() / "buffered", "wb");
  EXPECT_EQ(WriteText(*stream, std::string(2000, 'b')), 2000u);
  stream->Flush();
  EXPECT_EQ(TextOf(stream->LastError()), ErrnoText(ENOSPC));
  WriteText(*stream, "more");
  stream.reset();  // closing writes the buffer out again
  EXPECT_EQ(vyn::test::FileContents(dir.path() / "limited").size(), 1000u);
  EXPECT_EQ(vyn::test::FileContents(dir.path() / "buffered").size(), 1000u);
  sigset_t pending;
  sigpending(&pending);
  EXPECT_FALSE(sigismember(&pending, SIGXFSZ)) << "no signal is left waiting";
}
