// ExpandEnvironmentStringsW: %NAME% references replaced by the values of environment variables.

#include <algorithm>
#include <optional>
#include <string>
#include <string_view>

#include "win32/environment.h"
#include "win32/last_error.h"

namespace win32 {

namespace {

// The value of the variable, looked up as GetEnvironmentVariableW looks it up; nullopt when unset.
std::optional<std::u16string> ValueOf(std::u16string_view name) {
  const std::u16string key(name);
  std::u16string value(64, u'\0');
  for (;;) {
    const DWORD length = GetEnvironmentVariableW(key.c_str(), value.data(), static_cast<DWORD>(value.size()));
    if (length == 0) {
      if (GetLastError() != ERROR_SUCCESS) return std::nullopt;
      return std::u16string();
    }
    if (length < value.size()) {
      value.resize(length);
      return value;
    }
    value.resize(length);  // grown meanwhile, or too small: the size asked for
  }
}

std::u16string Expand(std::u16string_view text) {
  std::u16string out;
  out.reserve(text.size());
  std::size_t at = 0;
  while (at < text.size()) {
    if (text[at] != u'%') {
      const std::size_t next = std::min(text.find(u'%', at), text.size());
      out.append(text.substr(at, next - at));
      at = next;
      continue;
    }
    const std::size_t close = text.find(u'%', at + 1);
    if (close == std::u16string_view::npos) {
      out.append(text.substr(at));
      break;
    }
    const std::u16string_view name = text.substr(at + 1, close - at - 1);
    const std::optional<std::u16string> value = name.empty() ? std::nullopt : ValueOf(name);
    out.append(value ? std::u16string_view(*value) : text.substr(at, close + 1 - at));
    at = close + 1;
  }
  return out;
}

bool IsLeadSurrogate(MCHAR unit) { return unit >= 0xD800 && unit <= 0xDBFF; }

}  // namespace

DWORD ExpandEnvironmentStringsW(LPCWSTR src, LPWSTR dst, DWORD size) {
  const DWORD lastError = GetLastError();
  const std::u16string result = Expand(src != nullptr ? std::u16string_view(src) : std::u16string_view());
  SetLastError(lastError);
  const DWORD needed = static_cast<DWORD>(result.size() + 1);
  if (dst == nullptr) size = 0;
  if (needed <= size) {
    result.copy(dst, result.size());
    dst[result.size()] = 0;
    return needed;
  }
  if (size > 0) {
    // A caller that overlooks the result still gets terminated text, cut at a whole character.
    std::size_t kept = size - 1;
    if (kept > 0 && IsLeadSurrogate(result[kept - 1])) --kept;
    result.copy(dst, kept);
    dst[kept] = 0;
  }
  SetLastError(ERROR_INSUFFICIENT_BUFFER);
  return needed;
}

}  // namespace win32
