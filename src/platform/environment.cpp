// Environment variables: Win32 names and values over the UTF-8 POSIX environment.

#include "win32/environment.h"

#include <cerrno>
#include <cstring>
#include <mutex>
#include <string_view>

#include "syscalls.h"
#include "utf_strings.h"
#include "win32/crt_string.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"

extern char** environ;

namespace win32 {

namespace {

// Serialises the library's own reads and writes of the environment: getenv is not safe against a
// concurrent setenv.
std::mutex g_environmentLock;

bool ContainsEquals(LPCWSTR name) {
  for (LPCWSTR unit = name; *unit != 0; ++unit) {
    if (*unit == u'=') return true;
  }
  return false;
}

bool IsValidName(LPCWSTR name) { return name != nullptr && name[0] != 0 && !ContainsEquals(name); }

// The name under which the variable is stored: the exact name when set, else the first variable
// whose name matches without regard to case. Call with the lock held.
std::optional<std::string> StoredName(LPCWSTR name, const std::string& utf8Name) {
  if (sys::Syscalls().getenv(utf8Name.c_str()) != nullptr) return utf8Name;
  for (char** entry = environ; entry != nullptr && *entry != nullptr; ++entry) {
    const char* equals = std::strchr(*entry, '=');
    if (equals == nullptr || equals == *entry) continue;
    const std::string_view candidate(*entry, static_cast<std::size_t>(equals - *entry));
    if (_wcsicmp(detail::Utf16Of(candidate).c_str(), name) == 0) return std::string(candidate);
  }
  return std::nullopt;
}

// The value of name, matched as Win32 matches it; nullopt when unset.
std::optional<std::u16string> LookUp(LPCWSTR name) {
  const std::string utf8Name = detail::Utf8Of(name);
  std::lock_guard<std::mutex> lock(g_environmentLock);
  const std::optional<std::string> stored = StoredName(name, utf8Name);
  if (!stored) return std::nullopt;
  const char* value = sys::Syscalls().getenv(stored->c_str());
  if (value == nullptr) return std::nullopt;
  return detail::Utf16Of(value);
}

BOOL FailWithErrno() {
  SetLastError(ErrorFromErrno(errno));
  return FALSE;
}

}  // namespace

DWORD GetEnvironmentVariableW(LPCWSTR name, LPWSTR buffer, DWORD size) {
  const std::optional<std::u16string> value =
      IsValidName(name) ? LookUp(name) : std::optional<std::u16string>();
  if (!value) {
    SetLastError(ERROR_ENVVAR_NOT_FOUND);
    return 0;
  }
  if (buffer == nullptr) size = 0;
  const DWORD length = static_cast<DWORD>(value->size());
  if (length >= size) return length + 1;
  std::memcpy(buffer, value->data(), length * sizeof(MCHAR));
  buffer[length] = 0;
  if (length == 0) SetLastError(ERROR_SUCCESS);
  return length;
}

BOOL SetEnvironmentVariableW(LPCWSTR name, LPCWSTR value) {
  if (!IsValidName(name)) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
  }
  const std::string utf8Name = detail::Utf8Of(name);
  const sys::SyscallTable& calls = sys::Syscalls();
  std::lock_guard<std::mutex> lock(g_environmentLock);
  const std::optional<std::string> stored = StoredName(name, utf8Name);
  if (value == nullptr) {
    if (!stored) {
      SetLastError(ERROR_ENVVAR_NOT_FOUND);
      return FALSE;
    }
    return calls.unsetenv(stored->c_str()) == 0 ? TRUE : FailWithErrno();
  }
  // The new spelling goes in before the old one comes out, so a failure leaves the old value.
  if (calls.setenv(utf8Name.c_str(), detail::Utf8Of(value).c_str(), 1) != 0) return FailWithErrno();
  if (stored && *stored != utf8Name && calls.unsetenv(stored->c_str()) != 0) return FailWithErrno();
  return TRUE;
}

}  // namespace win32

namespace win32::detail {

std::optional<std::string> EnvironmentValue(const char* name) {
  std::lock_guard<std::mutex> lock(g_environmentLock);
  const char* value = sys::Syscalls().getenv(name);
  if (value == nullptr) return std::nullopt;
  return std::string(value);
}

}  // namespace win32::detail
