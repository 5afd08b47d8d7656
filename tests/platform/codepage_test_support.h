#pragma once
// Helpers of the code-page tests: whole texts through MultiByteToWideChar and WideCharToMultiByte,
// measured first and then converted into a buffer of exactly the measured size, and the check of
// a call that must fail with a given last error.

#include <gtest/gtest.h>

#include <string>

#include "win32/codepage.h"
#include "win32/last_error.h"

namespace codepage_test {

// bytes in code page cp, as MultiByteToWideChar reads them.
inline std::u16string Decode(UINT cp, const std::string& bytes, DWORD flags = 0) {
  const int n = static_cast<int>(bytes.size());
  const int needed = win32::MultiByteToWideChar(cp, flags, bytes.data(), n, nullptr, 0);
  std::u16string out(static_cast<std::size_t>(needed), u'\0');
  if (!out.empty()) {
    const int size = static_cast<int>(out.size());
    EXPECT_EQ(win32::MultiByteToWideChar(cp, flags, bytes.data(), n, out.data(), size), size);
  }
  return out;
}

// text in code page cp, as WideCharToMultiByte writes it.
inline std::string Encode(UINT cp, const std::u16string& text, DWORD flags = 0, BOOL* used = nullptr,
                          const char* defaultChar = nullptr) {
  const int n = static_cast<int>(text.size());
  const int needed = win32::WideCharToMultiByte(cp, flags, text.data(), n, nullptr, 0, defaultChar, used);
  std::string out(static_cast<std::size_t>(needed), '\0');
  if (needed > 0) {
    EXPECT_EQ(win32::WideCharToMultiByte(cp, flags, text.data(), n, out.data(), needed, defaultChar, used), needed);
  }
  return out;
}

}  // namespace codepage_test

// The call fails (returns 0) with the given last error.
#define EXPECT_FAILS_WITH(call, error)              \
  do {                                              \
    win32::SetLastError(0);                         \
    EXPECT_EQ(call, 0);                             \
    EXPECT_EQ(win32::GetLastError(), DWORD(error)); \
  } while (0)
