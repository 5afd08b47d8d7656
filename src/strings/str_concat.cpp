// CStr, WStr and UTF8Str: concatenation. The joined text is a new block in the two blocks'
// common lossless encoding; the holder takes its form in the class's encoding.

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

template <class Text>
void Append(typename Text::Unit*& buf, typename Text::Unit* other) {
  using Core = StrCore<Text>;
  if (!other) return;
  if (!buf) {
    buf = Core::Share(other);
    return;
  }
  const VynSDK::Util::VynString joined = Core::Block(buf) + Core::Block(other);
  Core::Replace(buf, Core::FormOf(joined));
}

}  // namespace

WStr& WStr::operator+=(const WStr& other) {
  ::Append<WideText>(buf, other.buf);
  return *this;
}
WStr& WStr::Append(const WStr& other) { return *this += other; }
WStr& WStr::append(const WStr& other) { return *this += other; }
WStr WStr::operator+(const WStr& other) const {
  WStr result(*this);
  result += other;
  return result;
}

CStr& CStr::operator+=(const CStr& other) {
  ::Append<NarrowText>(buf, other.buf);
  return *this;
}
CStr& CStr::Append(const CStr& other) { return *this += other; }
CStr& CStr::append(const CStr& other) { return *this += other; }
CStr CStr::operator+(const CStr& other) const {
  CStr result(*this);
  result += other;
  return result;
}

UTF8Str& UTF8Str::operator+=(const UTF8Str& other) {
  ::Append<Utf8Text>(buf, other.buf);
  return *this;
}
UTF8Str& UTF8Str::Append(const UTF8Str& other) { return *this += other; }
UTF8Str& UTF8Str::append(const UTF8Str& other) { return *this += other; }
UTF8Str UTF8Str::operator+(const UTF8Str& other) const {
  UTF8Str result(*this);
  result += other;
  return result;
}
