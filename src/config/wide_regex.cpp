// UTF-16 text through std::wregex.

#include "config/wide_regex.h"

#include "strings/utf16_units.h"

namespace vyn::config {

namespace Units = VynSDK::Util::Utf16Units;

std::wstring ToRegexText(const std::u16string& text) {
  std::wstring out;
  out.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char16_t unit = text[i];
    if (Units::IsLeadSurrogate(unit) && i + 1 < text.size() && Units::IsTrailSurrogate(text[i + 1])) {
      out.push_back(static_cast<wchar_t>(Units::Combine(unit, text[i + 1])));
      ++i;
    } else {
      out.push_back(static_cast<wchar_t>(unit));
    }
  }
  return out;
}

std::u16string FromRegexText(const std::wstring& text) {
  std::u16string out;
  out.reserve(text.size());
  for (const wchar_t c : text) {
    MCHAR units[Units::kMaxUnits];
    const unsigned count = Units::Encode(static_cast<unsigned int>(c), units);
    out.append(units, units + count);
  }
  return out;
}

std::wregex CompileRegex(const std::u16string& pattern, bool icase) {
  auto flags = std::regex_constants::ECMAScript;
  if (icase) flags |= std::regex_constants::icase;
  return std::wregex(ToRegexText(pattern), flags);
}

bool RegexMatchesWhole(const std::wregex& regex, const std::u16string& text) {
  return std::regex_match(ToRegexText(text), regex);
}

}  // namespace vyn::config
