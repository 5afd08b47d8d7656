// The runtime's locale objects: _create_locale, _free_locale and the code page a locale's
// multi-byte functions use.

#include <cerrno>
#include <new>
#include <string_view>

#include "crt_format_locale.h"
#include "win32/codepage.h"
#include "win32/crt_format.h"

namespace win32 {

_locale_t _create_locale(int category, const char* locale) {
  if (locale == nullptr || category < LC_ALL_CRT || category > LC_TIME_CRT) {
    errno = EINVAL;
    return nullptr;
  }
  detail::ResolvedLocaleName resolved{};
  if (!detail::ResolveLocaleName(locale, &resolved)) {
    errno = EINVAL;
    return nullptr;
  }
  // Categories the name does not govern stay as in "C".
  const bool charType = category == LC_ALL_CRT || category == LC_CTYPE_CRT;
  const bool numeric = category == LC_ALL_CRT || category == LC_NUMERIC_CRT;
  auto* created = new (std::nothrow) VynCrtLocale{
      charType ? resolved.codePage : detail::kCLocaleCodePage,
      charType ? resolved.cCharType : true,
      numeric ? resolved.decimalPoint : '.',
  };
  if (created == nullptr) errno = ENOMEM;
  return created;
}

void _free_locale(_locale_t locale) { delete locale; }

UINT LocaleCodePage(_locale_t locale) { return detail::FormatLocale(locale).CodePage(); }

namespace detail {

UINT FormatLocale::CodePage() const noexcept {
  if (locale_ != nullptr) return locale_->codePage;
  if (activeCodePage_ == 0) activeCodePage_ = GetACP();
  return activeCodePage_;
}

}  // namespace detail

}  // namespace win32
