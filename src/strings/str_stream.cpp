// CStr and WStr on standard streams. Narrow streams get narrow text as it is and wide text in
// the active code page; wide streams (wchar_t: UTF-32 here) get the text as code points.

#include <ostream>
#include <string>

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

constexpr char32_t kReplacementCharacter = 0xFFFD;

bool IsLeadSurrogate(MCHAR u) { return u >= 0xD800 && u <= 0xDBFF; }
bool IsTrailSurrogate(MCHAR u) { return u >= 0xDC00 && u <= 0xDFFF; }

// UTF-16 text as wchar_t code points: a surrogate pair makes one, a lone surrogate U+FFFD.
std::wstring CodePointsOf(const MCHAR* s) {
  std::wstring out;
  for (; *s; ++s) {
    char32_t c = *s;
    if (IsLeadSurrogate(s[0]) && IsTrailSurrogate(s[1])) {
      c = 0x10000 + ((char32_t(s[0]) - 0xD800) << 10) + (char32_t(s[1]) - 0xDC00);
      ++s;
    } else if (IsLeadSurrogate(s[0]) || IsTrailSurrogate(s[0])) {
      c = kReplacementCharacter;
    }
    out.push_back(static_cast<wchar_t>(c));
  }
  return out;
}

}  // namespace

std::ostream& operator<<(std::ostream& os, const WStr& s) {
  if (s.buf) os << WideCore::Block(s.buf).ToACP().Get();
  return os;
}

std::wostream& operator<<(std::wostream& os, const WStr& s) {
  if (s.buf) os << CodePointsOf(s.buf);
  return os;
}

std::ostream& operator<<(std::ostream& os, const CStr& s) {
  if (s.buf) os << s.buf;
  return os;
}

std::wostream& operator<<(std::wostream& os, const CStr& s) {
  if (s.buf) os << CodePointsOf(NarrowCore::Block(s.buf).ToUTF16().Get());
  return os;
}
