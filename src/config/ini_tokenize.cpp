// The Tokenize rule: a literal text replaced by a token in written values.

#include "config/wide_regex.h"
#include "vynutil/ini_rules.h"

namespace Util {

struct Tokenize::Impl {
  bool active = false;  // an empty text to find would match between every two characters
  std::wregex pattern;
  std::wstring replacement;
};

Tokenize::Tokenize(const std::u16string& tokenizeFrom, const std::u16string& tokenizeTo) : m_impl(new Impl) {
  // Every character the grammar gives a meaning is escaped, so the text matches as it is.
  static const std::wregex special(LR"([.*+?()[\]\\{}^|$])", std::regex_constants::ECMAScript);
  const std::wstring literal = std::regex_replace(vyn::config::ToRegexText(tokenizeFrom), special, L"\\$&");
  m_impl->active = !literal.empty();
  m_impl->pattern = std::wregex(literal, std::regex_constants::ECMAScript | std::regex_constants::icase);
  m_impl->replacement = vyn::config::ToRegexText(tokenizeTo);
}

Tokenize::~Tokenize() = default;

WindowsInitializationFileRule::ProcessResult Tokenize::ProcessPreWrite(const std::u16string&, const std::u16string&,
                                                                       const std::u16string&, const std::u16string&,
                                                                       const std::u16string& newValue) const {
  std::u16string value = newValue;
  for (char16_t& unit : value) {
    if (unit == u'/') unit = u'\\';
  }
  if (!m_impl->active) return {Ok, value};
  const std::wstring replaced =
      std::regex_replace(vyn::config::ToRegexText(value), m_impl->pattern, m_impl->replacement);
  return {Ok, vyn::config::FromRegexText(replaced)};
}

}  // namespace Util
