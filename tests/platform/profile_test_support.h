#pragma once
// Helpers of the profile tests: calls with a marked buffer, so a test sees what a call wrote and
// what it left alone, and file contents byte for byte.

#include <string>

#include "file_test_helpers.h"
#include "support/temp_dir.h"
#include "win32/last_error.h"
#include "win32/profile.h"

namespace vyn::test {

using namespace std::string_literals;

// What a read call gave: its result, the whole buffer (unwritten units stay '#') and the last
// error it left.
struct Filled {
  DWORD result;
  std::u16string buffer;
  DWORD error;
};

inline Filled GetString(const MCHAR* section, const MCHAR* key, const MCHAR* fallback, DWORD size,
                        const std::u16string& file) {
  std::u16string buffer(size, u'#');
  win32::SetLastError(0xDEADBEEF);
  const DWORD result = win32::GetPrivateProfileStringW(section, key, fallback, buffer.data(), size,
                                                       file.c_str());
  return {result, buffer, win32::GetLastError()};
}

inline Filled GetSection(const MCHAR* section, DWORD size, const std::u16string& file) {
  std::u16string buffer(size, u'#');
  win32::SetLastError(0xDEADBEEF);
  const DWORD result = win32::GetPrivateProfileSectionW(section, buffer.data(), size, file.c_str());
  return {result, buffer, win32::GetLastError()};
}

// The value of a key, read with a large buffer ("<default>" when missing).
inline std::u16string Value(const MCHAR* section, const MCHAR* key, const std::u16string& file) {
  return GetString(section, key, u"<default>", 4096, file).buffer.c_str();
}

// The first units of a buffer: what a row expects to have been written.
inline std::u16string Prefix(const std::u16string& buffer, std::size_t units) {
  return buffer.substr(0, units);
}

// The bytes of name inside the folder.
inline std::string Bytes(const TempDir& dir, const std::string& name) {
  return Contents(dir.path() / name);
}

}  // namespace vyn::test
