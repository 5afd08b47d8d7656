// CStr, WStr and UTF8Str: equality and ordering, and the comparisons with raw text, one unit and
// an int. Null and empty text are equal; in ordering the null string comes first.

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

// Ordering with the null rules: the null string equals only itself and precedes everything.
template <class Text>
int Order(const typename Text::Unit* a, const typename Text::Unit* b) noexcept {
  if (!a || !b) return a ? 1 : (b ? -1 : 0);
  return StrCore<Text>::CompareText(a, b);
}

template <class Text>
bool Equal(const typename Text::Unit* a, const typename Text::Unit* b) noexcept {
  return StrCore<Text>::CompareText(a, b) == 0;
}

// True when the text is exactly the unit c; null and empty text equal only the zero unit.
template <class Text>
bool IsUnit(const typename Text::Unit* buf, typename Text::Unit c) noexcept {
  const auto* text = StrCore<Text>::Data(buf);
  return text[0] == c && (c == 0 || text[1] == 0);
}

}  // namespace

// ---- WStr -----------------------------------------------------------------------------------

bool WStr::operator==(const WStr& other) const noexcept { return Equal<WideText>(buf, other.buf); }
bool WStr::operator!=(const WStr& other) const noexcept { return !(*this == other); }
bool WStr::operator==(const MCHAR* other) const noexcept { return Equal<WideText>(buf, other); }
bool WStr::operator!=(const MCHAR* other) const noexcept { return !(*this == other); }
bool WStr::operator==(MCHAR c) const noexcept { return IsUnit<WideText>(buf, c); }
bool WStr::operator!=(MCHAR c) const noexcept { return !(*this == c); }
bool WStr::operator==(int) const noexcept { return WideCore::IsEmpty(buf); }
bool WStr::operator!=(int) const noexcept { return !WideCore::IsEmpty(buf); }
bool WStr::operator<(const WStr& other) const noexcept { return Order<WideText>(buf, other.buf) < 0; }
bool WStr::operator<=(const WStr& other) const noexcept { return Order<WideText>(buf, other.buf) <= 0; }
bool WStr::operator>(const WStr& other) const noexcept { return Order<WideText>(buf, other.buf) > 0; }
bool WStr::operator>=(const WStr& other) const noexcept { return Order<WideText>(buf, other.buf) >= 0; }

bool operator==(const MCHAR* a, const WStr& b) noexcept { return b == a; }
bool operator!=(const MCHAR* a, const WStr& b) noexcept { return b != a; }
bool operator==(int a, const WStr& b) noexcept { return b == a; }
bool operator!=(int a, const WStr& b) noexcept { return b != a; }

// ---- CStr -----------------------------------------------------------------------------------

bool CStr::operator==(const CStr& other) const noexcept { return Equal<NarrowText>(buf, other.buf); }
bool CStr::operator!=(const CStr& other) const noexcept { return !(*this == other); }
bool CStr::operator==(const char* other) const noexcept { return Equal<NarrowText>(buf, other); }
bool CStr::operator!=(const char* other) const noexcept { return !(*this == other); }
bool CStr::operator==(char c) const noexcept { return IsUnit<NarrowText>(buf, c); }
bool CStr::operator!=(char c) const noexcept { return !(*this == c); }
bool CStr::operator==(int) const noexcept { return NarrowCore::IsEmpty(buf); }
bool CStr::operator!=(int) const noexcept { return !NarrowCore::IsEmpty(buf); }
bool CStr::operator<(const CStr& other) const noexcept { return Order<NarrowText>(buf, other.buf) < 0; }
bool CStr::operator<=(const CStr& other) const noexcept { return Order<NarrowText>(buf, other.buf) <= 0; }
bool CStr::operator>(const CStr& other) const noexcept { return Order<NarrowText>(buf, other.buf) > 0; }
bool CStr::operator>=(const CStr& other) const noexcept { return Order<NarrowText>(buf, other.buf) >= 0; }

bool operator==(const char* a, const CStr& b) noexcept { return b == a; }
bool operator!=(const char* a, const CStr& b) noexcept { return b != a; }
bool operator==(int a, const CStr& b) noexcept { return b == a; }
bool operator!=(int a, const CStr& b) noexcept { return b != a; }

// ---- UTF8Str --------------------------------------------------------------------------------

bool UTF8Str::operator==(const UTF8Str& other) const noexcept { return Equal<Utf8Text>(buf, other.buf); }
bool UTF8Str::operator!=(const UTF8Str& other) const noexcept { return !(*this == other); }
bool UTF8Str::operator<(const UTF8Str& other) const noexcept { return Order<Utf8Text>(buf, other.buf) < 0; }
bool UTF8Str::operator<=(const UTF8Str& other) const noexcept { return Order<Utf8Text>(buf, other.buf) <= 0; }
bool UTF8Str::operator>(const UTF8Str& other) const noexcept { return Order<Utf8Text>(buf, other.buf) > 0; }
bool UTF8Str::operator>=(const UTF8Str& other) const noexcept { return Order<Utf8Text>(buf, other.buf) >= 0; }
