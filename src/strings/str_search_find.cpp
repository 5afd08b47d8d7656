// CStr and WStr: first and last, the index of a unit in the text. In narrow text only
// single-byte characters are matched; a double-byte character is stepped over as a whole.

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

// The unit index of the first (fromEnd: last) single-unit piece c; -1 when there is none.
template <class Text>
int Find(const typename Text::Unit* buf, typename Text::Unit c, bool fromEnd) {
  using Core = StrCore<Text>;
  if (Core::IsEmpty(buf) || c == 0) return -1;
  const auto chars = Text::Characters();
  int found = -1;
  for (std::size_t i = 0, n; (n = PieceLength(chars, buf + i)) != 0; i += n) {
    if (n != 1 || buf[i] != c) continue;
    found = Core::IntIndex(i);
    if (!fromEnd) break;
  }
  return found;
}

}  // namespace

int WStr::first(MCHAR c) const { return Find<WideText>(buf, c, false); }
int WStr::last(MCHAR c) const { return Find<WideText>(buf, c, true); }

int CStr::first(char c) const { return Find<NarrowText>(buf, c, false); }
int CStr::last(char c) const { return Find<NarrowText>(buf, c, true); }
