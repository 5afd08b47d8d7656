// Whole-string UTF conversions on top of the fast converters.

#include "utf_strings.h"

#include "win32/codepage.h"

namespace win32::detail {

std::string Utf8Of(std::u16string_view text) {
  std::string out(text::Utf16ToUtf8Length(text.data(), text.size()) + text::kUtf8WriteSlack, '\0');
  out.resize(text::Utf16ToUtf8(text.data(), text.size(), out.data()));
  return out;
}

std::u16string Utf16Of(std::string_view text) {
  std::u16string out(text.size(), u'\0');
  out.resize(text::Utf8ToUtf16(text.data(), text.size(), out.data()));
  return out;
}

}  // namespace win32::detail
