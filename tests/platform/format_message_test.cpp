// FormatMessageW for system messages: the texts, the buffer rules and the allocated form.

#include "win32/format_message.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "win32/last_error.h"

namespace {

using namespace win32;

constexpr DWORD kFromSystem = FORMAT_MESSAGE_FROM_SYSTEM;
constexpr DWORD kAllocate = FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM;

// The text FormatMessageW allocates for code, or "(fails: <error>)".
std::u16string SystemText(DWORD code, DWORD flags = kAllocate) {
  MCHAR* buffer = nullptr;
  SetLastError(0);
  const DWORD length = FormatMessageW(flags, nullptr, code, 0, reinterpret_cast<MCHAR*>(&buffer),
                                      0, nullptr);
  if (length == 0) {
    EXPECT_EQ(buffer, nullptr);
    const std::string error = std::to_string(GetLastError());
    return u"(fails: " + std::u16string(error.begin(), error.end()) + u")";
  }
  std::u16string text(buffer);
  EXPECT_EQ(text.size(), length) << "the result counts the characters without the terminator";
  EXPECT_EQ(LocalFree(buffer), nullptr);
  return text;
}

TEST(FormatMessage, SystemTextsAsWindowsHasThem) {
  // Source: "System Error Codes (0-499)", "(500-999)", "(1000-1299)", "(1700-3999)"; the
  // message texts end in the line break FormatMessage returns.
  struct Row {
    DWORD code;
    const MCHAR* text;
  };
  const std::vector<Row> rows = {
      {ERROR_SUCCESS, u"The operation completed successfully.\r\n"},
      {ERROR_FILE_NOT_FOUND, u"The system cannot find the file specified.\r\n"},
      {ERROR_ACCESS_DENIED, u"Access is denied.\r\n"},
      {ERROR_INVALID_PARAMETER, u"The parameter is incorrect.\r\n"},
      {ERROR_INSUFFICIENT_BUFFER, u"The data area passed to a system call is too small.\r\n"},
      {ERROR_ALREADY_EXISTS, u"Cannot create a file when that file already exists.\r\n"},
      {ERROR_ENVVAR_NOT_FOUND,
       u"The system could not find the environment option that was entered.\r\n"},
      {ERROR_NO_UNICODE_TRANSLATION,
       u"No mapping for the Unicode character exists in the target multi-byte code page.\r\n"},
      {ERROR_TIMEOUT, u"This operation returned because the timeout period expired.\r\n"},
      {ERROR_RESOURCE_NAME_NOT_FOUND,
       u"The specified resource name cannot be found in the image file.\r\n"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.code);
    EXPECT_EQ(SystemText(row.code), row.text);
  }
}

TEST(FormatMessage, EveryCodeTheLibraryReportsHasAText) {
  const DWORD codes[] = {
      ERROR_SUCCESS, ERROR_INVALID_FUNCTION, ERROR_FILE_NOT_FOUND, ERROR_PATH_NOT_FOUND,
      ERROR_TOO_MANY_OPEN_FILES, ERROR_ACCESS_DENIED, ERROR_INVALID_HANDLE,
      ERROR_NOT_ENOUGH_MEMORY, ERROR_INVALID_DATA, ERROR_OUTOFMEMORY, ERROR_INVALID_DRIVE,
      ERROR_NOT_SAME_DEVICE, ERROR_NO_MORE_FILES, ERROR_WRITE_PROTECT, ERROR_NOT_READY,
      ERROR_SHARING_VIOLATION, ERROR_LOCK_VIOLATION, ERROR_HANDLE_EOF, ERROR_HANDLE_DISK_FULL,
      ERROR_NOT_SUPPORTED, ERROR_BAD_NETPATH, ERROR_FILE_EXISTS, ERROR_CANNOT_MAKE,
      ERROR_INVALID_PARAMETER, ERROR_BROKEN_PIPE, ERROR_DISK_FULL, ERROR_INSUFFICIENT_BUFFER,
      ERROR_INVALID_NAME, ERROR_MOD_NOT_FOUND, ERROR_PROC_NOT_FOUND, ERROR_NEGATIVE_SEEK,
      ERROR_DIR_NOT_EMPTY, ERROR_BUSY, ERROR_ALREADY_EXISTS, ERROR_ENVVAR_NOT_FOUND,
      ERROR_FILENAME_EXCED_RANGE, ERROR_MORE_DATA, ERROR_WAIT_TIMEOUT, ERROR_DIRECTORY,
      ERROR_NOT_OWNER, ERROR_MR_MID_NOT_FOUND, ERROR_INVALID_ADDRESS, ERROR_ARITHMETIC_OVERFLOW,
      ERROR_ABANDONED_WAIT_0, ERROR_INVALID_FLAGS, ERROR_FILE_INVALID,
      ERROR_RESOURCE_DATA_NOT_FOUND, ERROR_RESOURCE_TYPE_NOT_FOUND,
      ERROR_RESOURCE_NAME_NOT_FOUND, ERROR_NO_UNICODE_TRANSLATION, ERROR_DLL_INIT_FAILED,
      ERROR_TIMEOUT,
  };
  for (DWORD code : codes) {
    SCOPED_TRACE(code);
    const std::u16string text = SystemText(code);
    ASSERT_GE(text.size(), 3u);
    EXPECT_EQ(text.substr(text.size() - 2), u"\r\n");
    EXPECT_EQ(text.find(u"\r\n"), text.size() - 2) << "one line";
  }
}

TEST(FormatMessage, CodesWithoutTextFail) {
  for (DWORD code : {7u, 9999u, 0x20000000u, 0xFFFFFFFFu}) {
    SCOPED_TRACE(code);
    MCHAR* buffer = reinterpret_cast<MCHAR*>(1);
    SetLastError(0);
    EXPECT_EQ(FormatMessageW(kAllocate, nullptr, code, 0, reinterpret_cast<MCHAR*>(&buffer), 0,
                             nullptr),
              0u);
    EXPECT_EQ(GetLastError(), ERROR_MR_MID_NOT_FOUND);
    EXPECT_EQ(buffer, nullptr);

    MCHAR room[256];
    SetLastError(0);
    EXPECT_EQ(FormatMessageW(kFromSystem, nullptr, code, 0, room, 256, nullptr), 0u);
    EXPECT_EQ(GetLastError(), ERROR_MR_MID_NOT_FOUND);
  }
}

TEST(FormatMessage, CallerBufferMustHoldTextAndTerminator) {
  const std::u16string expected = u"Access is denied.\r\n";  // 19 characters
  const DWORD exact = static_cast<DWORD>(expected.size() + 1);
  std::vector<MCHAR> room(64, u'#');

  EXPECT_EQ(FormatMessageW(kFromSystem, nullptr, ERROR_ACCESS_DENIED, 0, room.data(), exact,
                           nullptr),
            expected.size());
  EXPECT_EQ(std::u16string(room.data()), expected);
  EXPECT_EQ(room[exact], u'#') << "nothing written past the terminator";

  for (DWORD size : {0u, 1u, exact - 1}) {
    SCOPED_TRACE(size);
    std::fill(room.begin(), room.end(), u'#');
    SetLastError(0);
    EXPECT_EQ(FormatMessageW(kFromSystem, nullptr, ERROR_ACCESS_DENIED, 0, room.data(), size,
                             nullptr),
              0u);
    EXPECT_EQ(GetLastError(), ERROR_INSUFFICIENT_BUFFER);
    EXPECT_EQ(room[0], u'#');
  }
}

TEST(FormatMessage, AllocatedBufferHasAtLeastTheRequestedRoom) {
  MCHAR* buffer = nullptr;
  const DWORD length = FormatMessageW(kAllocate | FORMAT_MESSAGE_IGNORE_INSERTS, nullptr,
                                      ERROR_FILE_NOT_FOUND, 0x0409,
                                      reinterpret_cast<MCHAR*>(&buffer), 500, nullptr);
  ASSERT_EQ(length, 44u);
  ASSERT_NE(buffer, nullptr);
  buffer[499] = u'x';  // within the requested minimum (AddressSanitizer checks)
  EXPECT_EQ(std::u16string(buffer, length), u"The system cannot find the file specified.\r\n");
  LocalFree(buffer);
}

TEST(FormatMessage, InsertsAreLeftAsTheyAre) {
  const std::u16string expected =
      u"The system cannot find message text for message number 0x%1 in the message file for "
      u"%2.\r\n";
  EXPECT_EQ(SystemText(ERROR_MR_MID_NOT_FOUND), expected);
  EXPECT_EQ(SystemText(ERROR_MR_MID_NOT_FOUND, kAllocate | FORMAT_MESSAGE_IGNORE_INSERTS),
            expected);
}

TEST(FormatMessage, OnlySystemMessagesIntoARealBuffer) {
  MCHAR room[128];
  struct Row {
    const char* name;
    DWORD flags;
    MCHAR* buffer;
  };
  const Row rows[] = {
      {"no source flag", 0, room},
      {"from string", FORMAT_MESSAGE_FROM_STRING | kFromSystem, room},
      {"null buffer", kFromSystem, nullptr},
      {"null allocation target", kAllocate, nullptr},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    SetLastError(0);
    EXPECT_EQ(FormatMessageW(row.flags, nullptr, ERROR_ACCESS_DENIED, 0, row.buffer, 128, nullptr),
              0u);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
  }
}

TEST(LocalHeap, FixedAndZeroedBlocks) {
  auto* zeroed = static_cast<unsigned char*>(LocalAlloc(LMEM_ZEROINIT, 300));
  ASSERT_NE(zeroed, nullptr);
  for (int i = 0; i < 300; ++i) ASSERT_EQ(zeroed[i], 0);
  EXPECT_EQ(LocalFree(zeroed), nullptr);

  void* empty = LocalAlloc(LMEM_FIXED, 0);
  EXPECT_NE(empty, nullptr);
  EXPECT_EQ(LocalFree(empty), nullptr);
  EXPECT_EQ(LocalFree(nullptr), nullptr);

  SetLastError(0);
  EXPECT_EQ(LocalAlloc(0x0002 /* LMEM_MOVEABLE */, 16), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
}

}  // namespace
