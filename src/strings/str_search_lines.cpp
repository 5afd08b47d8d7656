// CStr, WStr and UTF8Str: NumberOfLines, the count of line feeds. A line feed unit (0x0A) is a
// character of its own in every encoding the classes hold: it is never a UTF-8 continuation byte,
// a surrogate or the trail byte of a double-byte character.

#include <algorithm>

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

template <class Text>
std::size_t LineFeeds(const typename Text::Unit* buf) {
  const auto* text = StrCore<Text>::Data(buf);
  return static_cast<std::size_t>(std::count(text, text + StrCore<Text>::Length(buf), typename Text::Unit('\n')));
}

}  // namespace

std::size_t WStr::NumberOfLines() const { return LineFeeds<WideText>(buf); }
std::size_t CStr::NumberOfLines() const { return LineFeeds<NarrowText>(buf); }
std::size_t UTF8Str::NumberOfLines() const { return LineFeeds<Utf8Text>(buf); }
