#pragma once
// The runtime locale object behind _locale_t, and the view of it that the formatting engine
// reads: the code page for narrow <-> wide argument text and the decimal point.

#include <string_view>

#include "vynutil/crt_locale.h"
#include "vynutil/wintypes.h"

// What a runtime locale made by _create_locale holds.
struct VynCrtLocale {
  UINT codePage;      // the character type's code page (28591 for "C")
  bool cCharType;     // "C" character type: bytes are U+0000..U+00FF, no best-fit encoding
  char decimalPoint;  // the numeric category's decimal point
};

namespace win32::detail {

// The code page of the runtime's "C" character type: each byte is the character of its number.
inline constexpr UINT kCLocaleCodePage = 28591;

// What a locale name resolves to, before the category picks its parts.
struct ResolvedLocaleName {
  UINT codePage;
  bool cCharType;
  char decimalPoint;
};

// Resolves a Windows locale name ("C", "", "Japanese", "English_United States.1252", ".932",
// "ja-JP" ...); false when the name or its code page is not usable.
bool ResolveLocaleName(std::string_view name, ResolvedLocaleName* resolved);

// The settings one formatting call uses: those of the given locale, or for null the process's
// (the active code page, '.' as the runtime's numeric category stays "C").
class FormatLocale {
 public:
  explicit FormatLocale(_locale_t locale) noexcept : locale_(locale) {}

  // The code page of narrow arguments; the active code page is looked up on first use.
  UINT CodePage() const noexcept;
  // True when wide text must map one-to-one onto bytes (the "C" character type).
  bool StrictEncoding() const noexcept { return locale_ != nullptr && locale_->cCharType; }
  char DecimalPoint() const noexcept { return locale_ != nullptr ? locale_->decimalPoint : '.'; }

 private:
  _locale_t locale_;
  mutable UINT activeCodePage_ = 0;
};

}  // namespace win32::detail
