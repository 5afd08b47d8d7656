// Selection methods and the selectors made from them.

#include "config/wide_regex.h"
#include "vynutil/ini_rules.h"

namespace Util {

SelectionMethod::SelectionMethod(Method method, const MCHAR* pattern)
    : m_pattern(pattern != nullptr ? pattern : u""), m_method(method) {}

Selector::~Selector() = default;

bool Selector::Match(const std::u16string&) const { return true; }

StringSelector::StringSelector(const std::u16string& pattern) : m_pattern(pattern) {}

bool StringSelector::Match(const std::u16string& text) const { return text == m_pattern; }

RegexSelector::RegexSelector(const std::u16string& pattern) : m_regex(vyn::config::CompileRegex(pattern, true)) {}

bool RegexSelector::Match(const std::u16string& text) const { return vyn::config::RegexMatchesWhole(m_regex, text); }

}  // namespace Util
