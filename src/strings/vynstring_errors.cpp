// VynString texts for runtime (errno) and Win32 error codes.

#include <cstring>

#include "vynutil/vynstring.h"
#include "win32/format_message.h"

namespace VynSDK::Util {

VynString VynString::FromAnsiError(int errnum) {
  char buffer[256];
  // The runtime's strerror text, through the thread-safe GNU strerror_r (which returns either
  // buffer or a static text).
  const char* text = strerror_r(errnum, buffer, sizeof(buffer));
  return FromCP(CP_ACP, text, VYN_STRING_TO_TERMINATOR);
}

namespace {

// "Unknown Win32 Error Code 0x%08x" for code.
VynString UnknownWin32Error(DWORD code) {
  static constexpr char16_t kPrefix[] = u"Unknown Win32 Error Code 0x";
  static constexpr char kHex[] = "0123456789abcdef";
  MCHAR text[128];
  std::size_t n = 0;
  for (const char16_t* p = kPrefix; *p; ++p) text[n++] = *p;
  for (int shift = 28; shift >= 0; shift -= 4) text[n++] = static_cast<MCHAR>(kHex[(code >> shift) & 0xF]);
  text[n] = 0;
  return VynString::FromUTF16(text, n);
}

}  // namespace

VynString VynString::FromWin32Error(DWORD code) {
  MCHAR* buffer = nullptr;
  DWORD flags = win32::FORMAT_MESSAGE_ALLOCATE_BUFFER | win32::FORMAT_MESSAGE_FROM_SYSTEM;
  DWORD written = win32::FormatMessageW(flags, nullptr, code, 0, reinterpret_cast<MCHAR*>(&buffer), 0, nullptr);
  if (written == 0 || !buffer) {
    if (buffer) win32::LocalFree(buffer);
    return UnknownWin32Error(code);
  }
  VynString text = FromUTF16(buffer, VYN_STRING_TO_TERMINATOR);
  win32::LocalFree(buffer);
  return text;
}

}  // namespace VynSDK::Util
