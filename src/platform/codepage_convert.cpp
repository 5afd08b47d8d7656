// MultiByteToWideChar and WideCharToMultiByte: Win32's parameter, flag and buffer rules around
// the codecs.

#include <emmintrin.h>

#include <climits>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "codepage_codec.h"
#include "codepage_compose.h"
#include "codepage_registry.h"
#include "win32/codepage.h"
#include "win32/last_error.h"

namespace win32 {

namespace {

using detail::CodePageEntry;
using detail::CodePageKind;
using detail::ConvResult;
using detail::ConvStatus;

int Fail(DWORD error) {
  SetLastError(error);
  return 0;
}

int Finish(const ConvResult& r) {
  switch (r.status) {
    case ConvStatus::kInvalid: return Fail(ERROR_NO_UNICODE_TRANSLATION);
    case ConvStatus::kBufferTooSmall: return Fail(ERROR_INSUFFICIENT_BUFFER);
    case ConvStatus::kOk: break;
  }
  if (r.count > static_cast<std::size_t>(INT_MAX)) return Fail(ERROR_ARITHMETIC_OVERFLOW);
  return static_cast<int>(r.count);
}

bool Overlap(const void* a, std::size_t aBytes, const void* b, std::size_t bBytes) {
  const auto x = reinterpret_cast<std::uintptr_t>(a);
  const auto y = reinterpret_cast<std::uintptr_t>(b);
  return x < y + bBytes && y < x + aBytes;
}

// The units before the first zero unit. Reads whole aligned 16-byte blocks, which never cross a
// page, so it may look past the terminator within the last block.
__attribute__((no_sanitize("address"))) std::size_t Utf16Length(const char16_t* s) {
  const auto address = reinterpret_cast<std::uintptr_t>(s);
  const auto* block = reinterpret_cast<const __m128i*>(address & ~std::uintptr_t{15});
  const unsigned skip = static_cast<unsigned>(address & 15);
  const __m128i zero = _mm_setzero_si128();
  unsigned mask = static_cast<unsigned>(_mm_movemask_epi8(_mm_cmpeq_epi16(*block, zero)));
  mask = (mask >> skip) << skip;
  while (mask == 0) {
    ++block;
    mask = static_cast<unsigned>(_mm_movemask_epi8(_mm_cmpeq_epi16(*block, zero)));
  }
  const auto found = reinterpret_cast<std::uintptr_t>(block) + __builtin_ctz(mask);
  return (found - address) / sizeof(char16_t);
}

// The CP_UTF8 entry, looked up once: the most common code page skips the lookup.
const CodePageEntry& Utf8Entry() {
  static const CodePageEntry* const entry = detail::FindCodePage(CP_UTF8);
  return *entry;
}

bool DecodeFlagsValid(const CodePageEntry& entry, DWORD flags) {
  switch (entry.kind) {
    case CodePageKind::kStateful: return flags == 0;
    case CodePageKind::kUtf8: return (flags & ~MB_ERR_INVALID_CHARS) == 0;
    default: break;
  }
  constexpr DWORD kKnown = MB_PRECOMPOSED | MB_COMPOSITE | MB_USEGLYPHCHARS | MB_ERR_INVALID_CHARS;
  if (flags & ~kKnown) return false;
  return (flags & (MB_PRECOMPOSED | MB_COMPOSITE)) != (MB_PRECOMPOSED | MB_COMPOSITE);
}

// The error for flags, default character and used-default report the code page does not take,
// or 0.
DWORD EncodeArgumentsError(const CodePageEntry& entry, DWORD flags, const char* defaultChar,
                           const BOOL* usedDefault) {
  switch (entry.kind) {
    case CodePageKind::kUtf8:
      if (defaultChar != nullptr || usedDefault != nullptr) return ERROR_INVALID_PARAMETER;
      return (flags & ~WC_ERR_INVALID_CHARS) ? ERROR_INVALID_FLAGS : 0;
    case CodePageKind::kStateful:
      // Windows converts to these code pages only without flags and without the used-default
      // report (and, for UTF-7, without a default character).
      if (usedDefault != nullptr || (entry.codePage == CP_UTF7 && defaultChar != nullptr)) {
        return ERROR_INVALID_PARAMETER;
      }
      return flags != 0 ? ERROR_INVALID_FLAGS : 0;
    default: {
      // WC_ERR_INVALID_CHARS is for UTF-8 only.
      constexpr DWORD kKnown =
          WC_COMPOSITECHECK | WC_DISCARDNS | WC_SEPCHARS | WC_DEFAULTCHAR | WC_NO_BEST_FIT_CHARS;
      return (flags & ~kKnown) ? ERROR_INVALID_FLAGS : 0;
    }
  }
}

// Decodes to a temporary text, then decomposes it into the caller's buffer.
ConvResult DecodeComposite(const detail::Codec& codec, const char* s, std::size_t n, bool strict,
                           bool glyphs, MCHAR* out, std::size_t capacity) {
  const ConvResult measured = codec.Decode(s, n, strict, glyphs, nullptr, 0);
  if (measured.status != ConvStatus::kOk) return measured;
  std::vector<char16_t> text(measured.count + 1);
  const ConvResult decoded = codec.Decode(s, n, strict, glyphs, text.data(), text.size());
  if (decoded.status != ConvStatus::kOk) return decoded;
  return detail::Decompose(text.data(), decoded.count, out, capacity);
}

}  // namespace

int MultiByteToWideChar(UINT CodePage, DWORD dwFlags, const char* lpMultiByteStr, int cbMultiByte,
                        MCHAR* lpWideCharStr, int cchWideChar) {
  if (lpMultiByteStr == nullptr || cbMultiByte == 0 || cbMultiByte < -1 || cchWideChar < 0 ||
      (cchWideChar > 0 && lpWideCharStr == nullptr)) {
    return Fail(ERROR_INVALID_PARAMETER);
  }
  const std::size_t n =
      cbMultiByte == -1 ? std::strlen(lpMultiByteStr) + 1 : static_cast<std::size_t>(cbMultiByte);
  const auto capacity = static_cast<std::size_t>(cchWideChar);
  if (capacity > 0 && Overlap(lpMultiByteStr, n, lpWideCharStr, capacity * sizeof(MCHAR))) {
    return Fail(ERROR_INVALID_PARAMETER);
  }
  const bool strict = (dwFlags & MB_ERR_INVALID_CHARS) != 0;
  const CodePageEntry* entry =
      CodePage == CP_UTF8 ? &Utf8Entry() : detail::LookUpCodePage(CodePage);
  if (entry == nullptr) return Fail(ERROR_INVALID_PARAMETER);
  if (!DecodeFlagsValid(*entry, dwFlags)) return Fail(ERROR_INVALID_FLAGS);
  if (entry->kind == CodePageKind::kUtf8) {  // the common case, without the codec
    return Finish(detail::DecodeUtf8Bounded(lpMultiByteStr, n, strict, lpWideCharStr, capacity));
  }
  const detail::Codec* codec = detail::GetCodec(*entry);
  if (codec == nullptr) return Fail(ERROR_INVALID_PARAMETER);

  const bool glyphs = (dwFlags & MB_USEGLYPHCHARS) != 0;
  if (dwFlags & MB_COMPOSITE) {
    return Finish(
        DecodeComposite(*codec, lpMultiByteStr, n, strict, glyphs, lpWideCharStr, capacity));
  }
  return Finish(codec->Decode(lpMultiByteStr, n, strict, glyphs, lpWideCharStr, capacity));
}

int WideCharToMultiByte(UINT CodePage, DWORD dwFlags, const MCHAR* lpWideCharStr, int cchWideChar,
                        char* lpMultiByteStr, int cbMultiByte, const char* lpDefaultChar,
                        BOOL* lpUsedDefaultChar) {
  if (lpWideCharStr == nullptr || cchWideChar == 0 || cchWideChar < -1 || cbMultiByte < 0 ||
      (cbMultiByte > 0 && lpMultiByteStr == nullptr)) {
    return Fail(ERROR_INVALID_PARAMETER);
  }
  const std::size_t n =
      cchWideChar == -1 ? Utf16Length(lpWideCharStr) + 1 : static_cast<std::size_t>(cchWideChar);
  const auto capacity = static_cast<std::size_t>(cbMultiByte);
  if (capacity > 0 && Overlap(lpWideCharStr, n * sizeof(MCHAR), lpMultiByteStr, capacity)) {
    return Fail(ERROR_INVALID_PARAMETER);
  }
  const CodePageEntry* entry =
      CodePage == CP_UTF8 ? &Utf8Entry() : detail::LookUpCodePage(CodePage);
  if (entry == nullptr) return Fail(ERROR_INVALID_PARAMETER);
  if (const DWORD error = EncodeArgumentsError(*entry, dwFlags, lpDefaultChar, lpUsedDefaultChar)) {
    return Fail(error);
  }
  if (entry->kind == CodePageKind::kUtf8) {  // the common case, without the codec
    return Finish(detail::EncodeUtf8Bounded(lpWideCharStr, n, (dwFlags & WC_ERR_INVALID_CHARS) != 0,
                                            lpMultiByteStr, capacity));
  }
  const detail::Codec* codec = detail::GetCodec(*entry);
  if (codec == nullptr) return Fail(ERROR_INVALID_PARAMETER);

  bool used = false;
  detail::EncodeOptions options;
  options.noBestFit = (dwFlags & WC_NO_BEST_FIT_CHARS) != 0;
  options.defaultChar = lpDefaultChar;
  options.usedDefault = lpUsedDefaultChar != nullptr ? &used : nullptr;

  ConvResult r;
  if (dwFlags & WC_COMPOSITECHECK) {
    const std::u16string composed =
        detail::ComposeForCodePage(lpWideCharStr, n, *codec, dwFlags, options.noBestFit);
    r = codec->Encode(composed.data(), composed.size(), options, lpMultiByteStr, capacity);
  } else {
    r = codec->Encode(lpWideCharStr, n, options, lpMultiByteStr, capacity);
  }
  if (r.status == ConvStatus::kOk && lpUsedDefaultChar != nullptr) {
    *lpUsedDefaultChar = used ? TRUE : FALSE;
  }
  return Finish(r);
}

}  // namespace win32
