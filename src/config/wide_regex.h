#pragma once
// Regular expressions (ECMAScript grammar) over UTF-16 text: the standard library has no char16_t
// regex, so patterns and texts go through std::wregex as UTF-32 (wchar_t is 32 bits here).
// Surrogate pairs become one code point; lone surrogates stay as they are, both ways.

#include <regex>
#include <string>

namespace vyn::config {

std::wstring ToRegexText(const std::u16string& text);
std::u16string FromRegexText(const std::wstring& text);

// pattern compiled as ECMAScript, case-insensitive when icase.
std::wregex CompileRegex(const std::u16string& pattern, bool icase);

// Whether the whole text matches.
bool RegexMatchesWhole(const std::wregex& regex, const std::u16string& text);

}  // namespace vyn::config
