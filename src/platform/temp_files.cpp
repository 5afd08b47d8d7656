// GetTempPathW and GetTempFileNameW.

#include "win32/temp_files.h"

#include <fcntl.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <optional>
#include <string>

#include "syscalls.h"
#include "utf_strings.h"
#include "win32/environment.h"
#include "win32/errno_map.h"
#include "win32/file_types.h"
#include "win32/last_error.h"
#include "win32/path_map.h"

namespace win32 {

namespace {

constexpr std::size_t kLongestFolder = MAX_PATH - 14;
constexpr std::size_t kPrefixLength = 3;
constexpr UINT kNames = 0xFFFF;  // numbers 1 to 0xFFFF

std::u16string HexOf(UINT number) {
  static constexpr char16_t kDigits[] = u"0123456789ABCDEF";
  std::u16string hex;
  do {
    hex.insert(hex.begin(), kDigits[number & 0xF]);
    number >>= 4;
  } while (number != 0);
  return hex;
}

std::u16string NameOf(const std::u16string& folder, const std::u16string& prefix, UINT number) {
  std::u16string name = folder;
  if (!name.empty() && name.back() != u'\\' && name.back() != u'/') name += u'\\';
  return name + prefix + HexOf(number & 0xFFFF) + u".tmp";
}

// The first number to try: the clock's low 16 bits, never 0.
UINT StartingNumber() {
  const auto ticks = std::chrono::steady_clock::now().time_since_epoch().count();
  const UINT number = static_cast<UINT>(ticks / 1000) & 0xFFFF;
  return number != 0 ? number : 1;
}

UINT Fail(DWORD error) {
  SetLastError(error);
  return 0;
}

}  // namespace

DWORD GetTempPathW(DWORD nBufferLength, LPWSTR lpBuffer) {
  std::optional<std::string> folder = detail::EnvironmentValue("TMPDIR");
  if (!folder || folder->empty()) folder = "/tmp";
  std::u16string text = detail::Utf16Of(*folder);
  std::replace(text.begin(), text.end(), u'/', u'\\');
  if (text.back() != u'\\') text += u'\\';
  if (lpBuffer == nullptr || text.size() + 1 > nBufferLength) {
    return static_cast<DWORD>(text.size() + 1);
  }
  std::copy(text.begin(), text.end(), lpBuffer);
  lpBuffer[text.size()] = 0;
  return static_cast<DWORD>(text.size());
}

UINT GetTempFileNameW(LPCWSTR lpPathName, LPCWSTR lpPrefixString, UINT uUnique,
                      LPWSTR lpTempFileName) {
  if (lpPathName == nullptr || lpTempFileName == nullptr) return Fail(ERROR_INVALID_PARAMETER);
  const std::u16string folder = lpPathName;
  if (folder.size() > kLongestFolder) return Fail(ERROR_BUFFER_OVERFLOW);
  std::u16string prefix = lpPrefixString != nullptr ? lpPrefixString : u"";
  prefix.resize(std::min(prefix.size(), kPrefixLength));

  auto writeName = [&](UINT number) {
    const std::u16string name = NameOf(folder, prefix, number);
    std::copy(name.begin(), name.end(), lpTempFileName);
    lpTempFileName[name.size()] = 0;
  };
  if (uUnique != 0) {
    writeName(uUnique);
    return uUnique;
  }
  const sys::SyscallTable& calls = sys::Syscalls();
  UINT number = StartingNumber();
  for (UINT tried = 0; tried < kNames; ++tried) {
    const std::string path = MapPath(NameOf(folder, prefix, number).c_str());
    const int fd = calls.open(path.c_str(), O_CREAT | O_EXCL | O_WRONLY | O_CLOEXEC, 0666);
    if (fd >= 0) {
      calls.close(fd);
      writeName(number);
      return number;
    }
    if (errno == ENOENT || errno == ENOTDIR) return Fail(ERROR_DIRECTORY);
    if (errno != EEXIST) return Fail(ErrorFromErrno(errno));
    number = number == kNames ? 1 : number + 1;
  }
  return Fail(ERROR_FILE_EXISTS);
}

}  // namespace win32
