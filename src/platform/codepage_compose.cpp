// Composition and decomposition for the Win32 conversion flags, with ICU's normalisation data.

#include "codepage_compose.h"

#include <unicode/uchar.h>
#include <unicode/unorm2.h>

#include "win32/codepage.h"

namespace win32::detail {

ConvResult Decompose(const char16_t* s, std::size_t n, char16_t* out, std::size_t capacity) {
  UErrorCode error = U_ZERO_ERROR;
  const UNormalizer2* nfd = unorm2_getNFDInstance(&error);
  if (U_FAILURE(error)) return {0, ConvStatus::kInvalid};
  const int32_t count = unorm2_normalize(nfd, s, static_cast<int32_t>(n), capacity ? out : nullptr,
                                         static_cast<int32_t>(capacity), &error);
  if (error == U_BUFFER_OVERFLOW_ERROR) {
    return capacity == 0 ? ConvResult{static_cast<std::size_t>(count), ConvStatus::kOk}
                         : ConvResult{0, ConvStatus::kBufferTooSmall};
  }
  if (U_FAILURE(error)) return {0, ConvStatus::kInvalid};
  return {static_cast<std::size_t>(count), ConvStatus::kOk};
}

std::u16string ComposeForCodePage(const char16_t* s, std::size_t n, const Codec& codec, DWORD flags,
                                  bool noBestFit) {
  UErrorCode error = U_ZERO_ERROR;
  const UNormalizer2* nfc = unorm2_getNFCInstance(&error);
  std::u16string text;
  text.reserve(n);
  for (std::size_t i = 0; i < n; ++i) {
    const char16_t base = s[i];
    const bool markFollows = i + 1 < n && u_charType(s[i + 1]) == U_NON_SPACING_MARK;
    if (!markFollows || U_FAILURE(error)) {
      text.push_back(base);
      continue;
    }
    const char16_t mark = s[i + 1];
    const UChar32 composed = unorm2_composePair(nfc, base, mark);
    ++i;  // the pair is handled here
    if (composed > 0 && composed <= 0xFFFF &&
        codec.CanEncode(static_cast<char16_t>(composed), noBestFit)) {
      text.push_back(static_cast<char16_t>(composed));
    } else if (flags & WC_DISCARDNS) {
      text.push_back(base);
    } else if (flags & WC_DEFAULTCHAR) {
      text.push_back(u'\uFFFF');
    } else {
      text.push_back(base);
      text.push_back(mark);
    }
  }
  return text;
}

}  // namespace win32::detail
