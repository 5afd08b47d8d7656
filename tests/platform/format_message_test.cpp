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
  MCHAR* buffer = reinterpret_cast<MCHAR*>(1);
  SetLastError(0);
  const DWORD length =
      FormatMessageW(flags, nullptr, code, 0, reinterpret_cast<MCHAR*>(&buffer), 0, nullptr);
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
  // message texts end in the line break FormatMessage returns. Inserts are left as they are.
  const std::u16string midNotFound =
      u"The system cannot find message text for message number 0x%1 in the message file for "
      u"%2.\r\n";
  const std::vector<std::pair<DWORD, std::u16string>> rows = {
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
      {ERROR_MR_MID_NOT_FOUND, midNotFound},
      {7, u"(fails: 317)"},  // no text: ERROR_MR_MID_NOT_FOUND
      {9999, u"(fails: 317)"},
      {0x20000000u, u"(fails: 317)"},
      {0xFFFFFFFFu, u"(fails: 317)"},
  };
  for (const auto& [code, text] : rows) EXPECT_EQ(SystemText(code), text) << code;
  EXPECT_EQ(SystemText(ERROR_MR_MID_NOT_FOUND, kAllocate | FORMAT_MESSAGE_IGNORE_INSERTS),
            midNotFound);
}

TEST(FormatMessage, EveryCodeTheLibraryReportsHasAOneLineText) {
  for (DWORD code :
       {ERROR_INVALID_FUNCTION, ERROR_PATH_NOT_FOUND, ERROR_TOO_MANY_OPEN_FILES, ERROR_INVALID_HANDLE,
        ERROR_NOT_ENOUGH_MEMORY, ERROR_INVALID_DATA, ERROR_OUTOFMEMORY, ERROR_INVALID_DRIVE, ERROR_NOT_SAME_DEVICE,
        ERROR_NO_MORE_FILES, ERROR_WRITE_PROTECT, ERROR_NOT_READY, ERROR_SHARING_VIOLATION, ERROR_LOCK_VIOLATION,
        ERROR_HANDLE_EOF, ERROR_HANDLE_DISK_FULL, ERROR_NOT_SUPPORTED, ERROR_BAD_NETPATH, ERROR_FILE_EXISTS,
        ERROR_CANNOT_MAKE, ERROR_BROKEN_PIPE, ERROR_DISK_FULL, ERROR_INVALID_NAME, ERROR_MOD_NOT_FOUND,
        ERROR_PROC_NOT_FOUND, ERROR_NEGATIVE_SEEK, ERROR_DIR_NOT_EMPTY, ERROR_BUSY, ERROR_FILENAME_EXCED_RANGE,
        ERROR_MORE_DATA, ERROR_WAIT_TIMEOUT, ERROR_DIRECTORY, ERROR_NOT_OWNER, ERROR_INVALID_ADDRESS,
        ERROR_ARITHMETIC_OVERFLOW, ERROR_ABANDONED_WAIT_0, ERROR_INVALID_FLAGS, ERROR_FILE_INVALID,
        ERROR_RESOURCE_DATA_NOT_FOUND, ERROR_RESOURCE_TYPE_NOT_FOUND, ERROR_DLL_INIT_FAILED}) {
    const std::u16string text = SystemText(code);
    EXPECT_TRUE(text.size() >= 3 && text.find(u"\r\n") == text.size() - 2) << code;
  }
}

TEST(FormatMessage, CallerBufferRules) {
  const std::u16string expected = u"Access is denied.\r\n";  // 19 characters
  const DWORD exact = static_cast<DWORD>(expected.size() + 1);
  std::vector<MCHAR> room(64, u'#');
  EXPECT_EQ(FormatMessageW(kFromSystem, nullptr, ERROR_ACCESS_DENIED, 0, room.data(), exact,
                           nullptr),
            expected.size());
  EXPECT_EQ(std::u16string(room.data()), expected);
  EXPECT_EQ(room[exact], u'#') << "nothing written past the terminator";

  struct Row {
    const char* name;
    DWORD flags, code, size;
    bool buffer;
    DWORD error;
  };
  const Row rows[] = {
      {"no room", kFromSystem, ERROR_ACCESS_DENIED, 0, true, ERROR_INSUFFICIENT_BUFFER},
      {"room for 1", kFromSystem, ERROR_ACCESS_DENIED, 1, true, ERROR_INSUFFICIENT_BUFFER},
      {"no room for the terminator", kFromSystem, ERROR_ACCESS_DENIED, exact - 1, true,
       ERROR_INSUFFICIENT_BUFFER},
      {"code without text", kFromSystem, 9999, 64, true, ERROR_MR_MID_NOT_FOUND},
      {"no source flag", 0, ERROR_ACCESS_DENIED, 64, true, ERROR_INVALID_PARAMETER},
      {"from string", FORMAT_MESSAGE_FROM_STRING | kFromSystem, ERROR_ACCESS_DENIED, 64, true,
       ERROR_INVALID_PARAMETER},
      {"null buffer", kFromSystem, ERROR_ACCESS_DENIED, 64, false, ERROR_INVALID_PARAMETER},
      {"null allocation target", kAllocate, ERROR_ACCESS_DENIED, 64, false,
       ERROR_INVALID_PARAMETER},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    std::fill(room.begin(), room.end(), u'#');
    SetLastError(0);
    EXPECT_EQ(FormatMessageW(row.flags, nullptr, row.code, 0, row.buffer ? room.data() : nullptr,
                             row.size, nullptr),
              0u);
    EXPECT_EQ(GetLastError(), row.error);
    EXPECT_EQ(room[0], u'#');
  }
}

TEST(FormatMessage, AllocatedBufferHasAtLeastTheRequestedRoom) {
  MCHAR* buffer = nullptr;
  const DWORD length = FormatMessageW(kAllocate | FORMAT_MESSAGE_IGNORE_INSERTS, nullptr,
                                      ERROR_FILE_NOT_FOUND, 0x0409,
                                      reinterpret_cast<MCHAR*>(&buffer), 500, nullptr);
  ASSERT_EQ(length, 44u);
  buffer[499] = u'x';  // within the requested minimum (AddressSanitizer checks)
  EXPECT_EQ(std::u16string(buffer, length), u"The system cannot find the file specified.\r\n");
  LocalFree(buffer);
}

TEST(LocalHeap, FixedAndZeroedBlocks) {
  auto* zeroed = static_cast<unsigned char*>(LocalAlloc(LMEM_ZEROINIT, 300));
  ASSERT_NE(zeroed, nullptr);
  EXPECT_TRUE(std::all_of(zeroed, zeroed + 300, [](unsigned char c) { return c == 0; }));
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
