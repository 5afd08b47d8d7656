// Binary streams over Win32 file handles: ownership, the end-of-file flag, and failures reported
// through LastError() as system messages: refused calls and faults injected through the
// platform's system-call table (the file-size limit itself is the platform's file-handle test).

#include <gtest/gtest.h>

#include <cerrno>
#include <functional>
#include <string>

#include "files/binary_stream_test_support.h"
#include "support/temp_dir.h"
#include "syscalls.h"
#include "win32/file_handle.h"
#include "win32/last_error.h"

namespace {

using VynSDK::Util::BinaryStream;
using vyn::test::ReadText;
using vyn::test::StreamPtr;
using vyn::test::TextOf;
using vyn::test::WriteText;
using Syscalls = win32::sys::SyscallTable;

// System messages of the Win32 error codes (System Error Codes reference).
constexpr char16_t kAccessDenied[] = u"Access is denied.\r\n";                   // 5
constexpr char16_t kInvalidHandle[] = u"The handle is invalid.\r\n";             // 6
constexpr char16_t kInvalidParameter[] = u"The parameter is incorrect.\r\n";     // 87
constexpr char16_t kDiskFull[] = u"There is not enough space on the disk.\r\n";  // 112
constexpr char16_t kNegativeSeek[] =
    u"An attempt was made to move the file pointer before the beginning of the file.\r\n";  // 131

HANDLE OpenHandle(const std::u16string& path, DWORD access) {
  return win32::CreateFileW(path.c_str(), access, win32::FILE_SHARE_READ, nullptr, win32::OPEN_ALWAYS,
                            win32::FILE_ATTRIBUTE_NORMAL, nullptr);
}

int g_writes = 0;

}  // namespace

TEST(BinaryStreamWin32, OwnershipAndTheEndOfFileFlag) {
  EXPECT_EQ(BinaryStream::FromFileHandle(nullptr, true), nullptr);
  EXPECT_EQ(BinaryStream::FromFileHandle(INVALID_HANDLE_VALUE, true), nullptr);
  vyn::test::TempDir dir;
  HANDLE handle = OpenHandle(dir.File("flag"), win32::GENERIC_READ | win32::GENERIC_WRITE);
  StreamPtr(BinaryStream::FromFileHandle(handle, false)).reset();
  StreamPtr stream(BinaryStream::FromFileHandle(handle, true));
  EXPECT_EQ(WriteText(*stream, "abc"), 3u) << "the handle outlived the stream that did not own it";
  // A short read at the end sets the flag; a write or a truncation clears it (a seek too, see
  // the tests of every kind).
  const std::function<void()> clears[] = {[&] { WriteText(*stream, "+"); }, [&] { stream->Truncate(); }};
  for (const auto& clear : clears) {
    stream->Seek(1, 0);
    EXPECT_EQ(ReadText(*stream, 100).substr(0, 2), "bc");
    EXPECT_TRUE(stream->IsEndOfFile());
    clear();
    EXPECT_FALSE(stream->IsEndOfFile());
  }
  EXPECT_TRUE(stream->LastError().IsNull());
  stream.reset();
  EXPECT_FALSE(win32::CloseHandle(handle)) << "closed by the stream that owned it";
}

TEST(BinaryStreamWin32, FailuresLeaveTheirSystemMessage) {
  const struct {
    const char* what;
    DWORD access;
    std::function<void(Syscalls&)> inject;  // null: no fault injected
    std::function<void(BinaryStream&)> call;
    const char16_t* message;
  } rows[] = {
      {"a write without write access", win32::GENERIC_READ, nullptr,
       [](BinaryStream& s) { EXPECT_EQ(WriteText(s, "abc"), 0u); }, kAccessDenied},
      {"a read without read access", win32::GENERIC_WRITE, nullptr,
       [](BinaryStream& s) { EXPECT_EQ(ReadText(s, 4), ""); EXPECT_FALSE(s.IsEndOfFile()); }, kAccessDenied},
      {"a truncation without write access", win32::GENERIC_READ, nullptr,
       [](BinaryStream& s) { s.Truncate(); }, kAccessDenied},
      {"a seek before the start", win32::GENERIC_READ, nullptr,
       [](BinaryStream& s) { EXPECT_EQ(s.Seek(-1, 0), -1); }, kNegativeSeek},
      {"a negative origin", win32::GENERIC_READ, nullptr,
       [](BinaryStream& s) { EXPECT_EQ(s.Seek(0, -1), -1); }, kInvalidParameter},
      {"a null read buffer", win32::GENERIC_READ, nullptr,
       [](BinaryStream& s) { EXPECT_EQ(s.Read(nullptr, 4), 0u); }, kInvalidParameter},
      {"a full device after three bytes", win32::GENERIC_READ | win32::GENERIC_WRITE,
       [](Syscalls& t) {
         t.write = [](int fd, const void* data, size_t) -> ssize_t {
           if (g_writes++ == 0) return win32::sys::DefaultSyscalls().write(fd, data, 3);
           errno = ENOSPC;
           return -1;
         };
       },
       [](BinaryStream& s) { EXPECT_EQ(WriteText(s, "abcdefgh"), 3u); }, kDiskFull},
      {"a refused read", win32::GENERIC_READ,
       [](Syscalls& t) { t.read = [](int, void*, size_t) -> ssize_t { errno = EACCES; return -1; }; },
       [](BinaryStream& s) { EXPECT_EQ(ReadText(s, 4), ""); EXPECT_FALSE(s.IsEndOfFile()); }, kAccessDenied},
      {"a truncation beyond the device", win32::GENERIC_READ | win32::GENERIC_WRITE,
       [](Syscalls& t) { t.ftruncate = [](int, off_t) { errno = EFBIG; return -1; }; },
       [](BinaryStream& s) { s.Seek(100, 0); s.Truncate(); }, kDiskFull},
  };
  vyn::test::TempDir dir;
  int n = 0;
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    const std::u16string path = dir.Write("file" + std::to_string(n++), "0123");
    StreamPtr stream(BinaryStream::FromFileHandle(OpenHandle(path, row.access), true));
    g_writes = 0;
    {
      win32::sys::ScopedSyscalls calls;
      if (row.inject) row.inject(calls.table());
      row.call(*stream);
    }
    EXPECT_EQ(TextOf(stream->LastError()), row.message);
  }
  // A handle closed behind the stream's back.
  HANDLE handle = OpenHandle(dir.File("file0"), win32::GENERIC_READ);
  StreamPtr stream(BinaryStream::FromFileHandle(handle, false));
  win32::CloseHandle(handle);
  EXPECT_EQ(ReadText(*stream, 4), "");
  EXPECT_EQ(TextOf(stream->LastError()), kInvalidHandle);
}
