// Integers and checksummed byte strings in profile values.

#include "profile_values.h"

#include <cstdint>

#include "win32/last_error.h"
#include "win32/profile.h"

namespace win32::detail::profile {

namespace {

// The value of a digit in any base up to 16, or 16 for a character that is no digit.
unsigned DigitValue(char16_t c) {
  if (c >= u'0' && c <= u'9') return c - u'0';
  if (c >= u'a' && c <= u'f') return c - u'a' + 10;
  if (c >= u'A' && c <= u'F') return c - u'A' + 10;
  return 16;
}

unsigned PrefixBase(char16_t c) {
  switch (c) {
    case u'x': case u'X': return 16;
    case u'o': case u'O': return 8;
    case u'b': case u'B': return 2;
    default: return 0;
  }
}

constexpr char16_t kHexDigits[] = u"0123456789ABCDEF";

}  // namespace

UINT ParseInteger(Text text) {
  std::size_t i = 0;
  while (i < text.size() && text[i] <= u' ') ++i;
  bool negative = false;
  if (i < text.size() && (text[i] == u'+' || text[i] == u'-')) negative = text[i++] == u'-';
  unsigned base = 10;
  if (i + 1 < text.size() && text[i] == u'0' && PrefixBase(text[i + 1]) != 0) {
    base = PrefixBase(text[i + 1]);
    i += 2;
  }
  std::uint32_t value = 0;
  for (; i < text.size(); ++i) {
    const unsigned digit = DigitValue(text[i]);
    if (digit >= base) break;
    value = value * base + digit;  // wraps modulo 2^32, as Windows does
  }
  return negative ? 0u - value : value;
}

std::u16string EncodeStruct(const void* bytes, UINT size) {
  const auto* data = static_cast<const unsigned char*>(bytes);
  std::u16string text;
  text.resize(2 * (std::size_t{size} + 1));
  unsigned sum = 0;
  std::size_t at = 0;
  for (UINT i = 0; i <= size; ++i) {
    const unsigned byte = i < size ? data[i] : (sum & 0xFF);
    sum += byte;
    text[at++] = kHexDigits[byte >> 4];
    text[at++] = kHexDigits[byte & 0xF];
  }
  return text;
}

DWORD DecodeStruct(Text text, void* out, UINT size) {
  if (text.size() != 2 * (std::uint64_t{size} + 1)) return ERROR_BAD_LENGTH;
  unsigned sum = 0;
  for (std::size_t i = 0; i < text.size(); i += 2) {
    const unsigned high = DigitValue(text[i]);
    const unsigned low = DigitValue(text[i + 1]);
    if (high > 15 || low > 15) return ERROR_INVALID_DATA;
    const unsigned byte = high << 4 | low;
    if (i + 2 < text.size()) {
      sum += byte;
    } else if ((sum & 0xFF) != byte) {
      return ERROR_INVALID_DATA;
    }
  }
  auto* data = static_cast<unsigned char*>(out);
  for (UINT i = 0; i < size; ++i) {
    const unsigned high = DigitValue(text[2 * i]);
    data[i] = static_cast<unsigned char>(high << 4 | DigitValue(text[2 * i + 1]));
  }
  return ERROR_SUCCESS;
}

}  // namespace win32::detail::profile
