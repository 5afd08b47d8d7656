// CStr and WStr: Substr, a new string of a run of units.

#include <algorithm>

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

// count units from start in a new block (a counted reference); null for the cases Substr gives
// the null string. Double-byte characters cut by either end are left out.
template <class Text>
typename Text::Unit* Substr(const typename Text::Unit* buf, int start, int count) {
  using Core = StrCore<Text>;
  if (!buf || start < 0 || count < 0) return nullptr;
  const std::size_t length = Core::Length(buf);
  const auto from = static_cast<std::size_t>(start);
  if (from > length) return nullptr;
  const std::size_t to = from + std::min(static_cast<std::size_t>(count), length - from);
  const auto chars = Text::Characters();
  const std::size_t begin = CharacterStartAtOrAfter(chars, buf, from);
  const std::size_t end = std::max(begin, CharacterStartAtOrBefore(chars, buf, to));
  return Core::NewText(buf + begin, end - begin);
}

}  // namespace

WStr WStr::Substr(int start, int count) const {
  WStr result;
  result.buf = ::Substr<WideText>(buf, start, count);
  return result;
}

CStr CStr::Substr(int start, int count) const {
  CStr result;
  result.buf = ::Substr<NarrowText>(buf, start, count);
  return result;
}
