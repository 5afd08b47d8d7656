// Code-page conversion under libFuzzer. The first byte picks a code page, the second the flags
// and the third an output size; the rest is the text. Checked: measuring and converting agree,
// buffers of every size either hold the result or fail with ERROR_INSUFFICIENT_BUFFER without
// writing past their end, strict mode fails only where the replacing mode replaced something,
// single-byte text round-trips, and the fast UTF-8 functions agree with the Win32 calls and ICU.
//
// Run: build-fuzz/fuzz/fuzz_codepage -max_total_time=300 fuzz/corpus/codepage

#include <unicode/ustring.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "win32/codepage.h"
#include "win32/last_error.h"

namespace {

using namespace win32;

constexpr UINT kCodePages[] = {1252,  1251,  1253,  1255,    1257,    437,    850,      866,
                               874,   932,   936,   949,     950,     10000,  20127,    28591,
                               28596, 50222, 50225, CP_UTF7, CP_UTF8, CP_ACP, CP_UTF16, 12345};

void Check(bool ok) {
  if (!ok) std::abort();
}

bool IsSingleByte(UINT cp) {
  CPINFO info;
  return GetCPInfo(cp, &info) && info.MaxCharSize == 1;
}

// MultiByteToWideChar measured, converted exactly, and converted into a buffer of `size`.
std::u16string Decode(UINT cp, DWORD flags, const std::string& text, int size, bool* failed) {
  const int n = static_cast<int>(text.size());
  SetLastError(0);
  const int needed = MultiByteToWideChar(cp, flags, text.data(), n, nullptr, 0);
  *failed = needed == 0;
  if (needed == 0) {
    const DWORD error = GetLastError();
    Check(error == ERROR_INVALID_PARAMETER || error == ERROR_INVALID_FLAGS ||
          error == ERROR_NO_UNICODE_TRANSLATION);
    return {};
  }
  std::u16string out(needed + 8, u'\xABCD');
  Check(MultiByteToWideChar(cp, flags, text.data(), n, out.data(), needed) == needed);
  for (int i = needed; i < needed + 8; ++i) Check(out[i] == u'\xABCD');
  out.resize(needed);
  if (size > 0) {
    std::u16string small(size + 8, u'\xABCD');
    SetLastError(0);
    const int got = MultiByteToWideChar(cp, flags, text.data(), n, small.data(), size);
    if (size >= needed) {
      Check(got == needed && small.compare(0, needed, out) == 0);
    } else {
      Check(got == 0 && GetLastError() == ERROR_INSUFFICIENT_BUFFER);
    }
    for (int i = size; i < size + 8; ++i) Check(small[i] == u'\xABCD');
  }
  return out;
}

std::string Encode(UINT cp, DWORD flags, const std::u16string& text, int size, BOOL* used) {
  const int n = static_cast<int>(text.size());
  SetLastError(0);
  const int needed = WideCharToMultiByte(cp, flags, text.data(), n, nullptr, 0, nullptr, used);
  if (needed == 0) return {};
  std::string out(needed + 8, '\x5A');
  BOOL used2 = FALSE;
  Check(WideCharToMultiByte(cp, flags, text.data(), n, out.data(), needed, nullptr,
                            used ? &used2 : nullptr) == needed);
  if (used) Check(used2 == *used);
  for (int i = needed; i < needed + 8; ++i) Check(out[i] == '\x5A');
  out.resize(needed);
  if (size > 0) {
    std::string small(size + 8, '\x5A');
    SetLastError(0);
    const int got =
        WideCharToMultiByte(cp, flags, text.data(), n, small.data(), size, nullptr, nullptr);
    if (size >= needed) {
      Check(got == needed && small.compare(0, needed, out) == 0);
    } else {
      Check(got == 0 && GetLastError() == ERROR_INSUFFICIENT_BUFFER);
    }
    for (int i = size; i < size + 8; ++i) Check(small[i] == '\x5A');
  }
  return out;
}

// The fast functions against the Win32 calls and ICU.
void CheckUtf8(const std::string& bytes, const std::u16string& units) {
  std::u16string wide(bytes.size(), u'\0');
  wide.resize(text::Utf8ToUtf16(bytes.data(), bytes.size(), wide.data()));
  Check(text::Utf8ToUtf16Length(bytes.data(), bytes.size()) == wide.size());
  std::u16string reference(bytes.size() + 1, u'\0');
  int32_t length = 0;
  UErrorCode error = U_ZERO_ERROR;
  u_strFromUTF8WithSub(reference.data(), static_cast<int32_t>(reference.size()), &length,
                       bytes.data(), static_cast<int32_t>(bytes.size()), 0xFFFD, nullptr, &error);
  reference.resize(length);
  Check(wide == reference);
  if (!bytes.empty()) {
    bool failed;
    Check(Decode(CP_UTF8, 0, bytes, 0, &failed) == wide);
  }

  std::string narrow(units.size() * 3, '\0');
  narrow.resize(text::Utf16ToUtf8(units.data(), units.size(), narrow.data()));
  Check(text::Utf16ToUtf8Length(units.data(), units.size()) == narrow.size());
  std::string utf8Reference(units.size() * 3 + 1, '\0');
  error = U_ZERO_ERROR;
  u_strToUTF8WithSub(utf8Reference.data(), static_cast<int32_t>(utf8Reference.size()), &length,
                     units.data(), static_cast<int32_t>(units.size()), 0xFFFD, nullptr, &error);
  utf8Reference.resize(length);
  Check(narrow == utf8Reference);
  if (!units.empty()) Check(Encode(CP_UTF8, 0, units, 0, nullptr) == narrow);
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  setenv("TAVLO_PLATFORM_ACP", "1252", 0);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size < 3) return 0;
  const UINT cp = kCodePages[data[0] % std::size(kCodePages)];
  const std::uint8_t flagBits = data[1];
  const int outSize = data[2];
  const std::string text(reinterpret_cast<const char*>(data + 3), size - 3);
  std::u16string units(text.size() / 2, u'\0');
  std::memcpy(units.data(), text.data(), units.size() * 2);

  CheckUtf8(text, units);
  if (text.empty()) return 0;

  // To UTF-16, replacing and strict.
  const DWORD decodeFlags = (flagBits & 1) ? MB_USEGLYPHCHARS : 0;
  bool failed;
  const std::u16string wide = Decode(cp, decodeFlags, text, outSize, &failed);
  bool strictFailed;
  const std::u16string strict =
      Decode(cp, decodeFlags | MB_ERR_INVALID_CHARS, text, outSize, &strictFailed);
  Check(!failed || strictFailed);
  if (!failed && !strictFailed) Check(strict == wide);
  if (!failed && (flagBits & 2)) Decode(cp, MB_COMPOSITE, text, outSize, &failed);

  // And back.
  if (!wide.empty()) {
    const DWORD encodeFlags = (flagBits & 4) ? WC_NO_BEST_FIT_CHARS : 0;
    BOOL used = FALSE;
    const bool reportsUsed = IsSingleByte(cp) || cp == 932 || cp == 936 || cp == 949 || cp == 950;
    const std::string back = Encode(cp, encodeFlags, wide, outSize, reportsUsed ? &used : nullptr);
    // Every byte of a single-byte code page converts and converts back (US-ASCII drops the
    // eighth bit).
    if (IsSingleByte(cp) && cp != 20127 && !(flagBits & 1)) {
      Check(back == text);
      Check(!used);
    }
    if (flagBits & 8) Encode(cp, WC_COMPOSITECHECK | WC_DISCARDNS, wide, outSize, nullptr);
  }
  // Arbitrary UTF-16 to the code page.
  if (!units.empty()) {
    BOOL used = FALSE;
    Encode(cp, 0, units, outSize, (IsSingleByte(cp) || cp == 932) ? &used : nullptr);
  }
  return 0;
}
