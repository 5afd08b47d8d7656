// CStr and WStr: Replace, every (or the first) occurrence of a text by another.
//
// The occurrences are found first, left to right without overlapping, then the text is rebuilt
// in one pass: in place, moving left, when the replacement is not longer than what it replaces,
// else from the right end of a buffer with room for the result. The result is the one that
// replacing one occurrence at a time, searching again after the text put in, gives.
// Occurrences are found as wcsstr finds them in UTF-16 text; in narrow text only those made of
// whole characters count, where strstr would also find one that starts on a trail byte.

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

// Unit indices of the occurrences of what in text from start on, each a run of whole characters.
template <class Text>
std::vector<std::size_t> FindOccurrences(std::basic_string_view<typename Text::Unit> text,
                                         std::basic_string_view<typename Text::Unit> what, std::size_t start,
                                         bool firstOnly) {
  const auto chars = Text::Characters();
  CharacterStarts starts(chars, text.data());
  std::vector<std::size_t> found;
  std::size_t from = CharacterStartAtOrAfter(chars, text.data(), start);
  for (std::size_t at; (at = text.find(what, from)) != text.npos;) {
    from = at + 1;
    if (!starts.IsStart(at)) continue;
    auto end = starts;
    if (!end.IsStart(at + what.size())) continue;
    starts = end;
    found.push_back(at);
    if (firstOnly) break;
    from = at + what.size();
  }
  return found;
}

// Rewrites text of length units in place (out has room for the result): the runs of what.size()
// units at the indices at become by, moving the text between them left.
template <class Unit>
void ShrinkInPlace(Unit* out, std::size_t length, const std::vector<std::size_t>& at, std::size_t findLength,
                   std::basic_string_view<Unit> by) {
  using Traits = std::char_traits<Unit>;
  std::size_t write = at.front();
  for (std::size_t k = 0; k < at.size(); ++k) {
    Traits::move(out + write, by.data(), by.size());
    write += by.size();
    const std::size_t read = at[k] + findLength;
    const std::size_t next = k + 1 < at.size() ? at[k + 1] : length;
    Traits::move(out + write, out + read, next - read);
    write += next - read;
  }
  out[write] = 0;
}

// The same when by is longer: works from the right end so that no unit is overwritten before it
// has moved.
template <class Unit>
void GrowInPlace(Unit* out, std::size_t length, const std::vector<std::size_t>& at, std::size_t findLength,
                 std::basic_string_view<Unit> by, std::size_t newLength) {
  using Traits = std::char_traits<Unit>;
  out[newLength] = 0;
  std::size_t readEnd = length;
  std::size_t writeEnd = newLength;
  for (std::size_t k = at.size(); k-- > 0;) {
    const std::size_t tail = readEnd - (at[k] + findLength);
    writeEnd -= tail;
    Traits::move(out + writeEnd, out + at[k] + findLength, tail);
    writeEnd -= by.size();
    Traits::copy(out + writeEnd, by.data(), by.size());
    readEnd = at[k];
  }
}

template <class Text>
std::size_t Replace(typename Text::Unit*& buf, const typename Text::Unit* find,
                    const typename Text::Unit* replaceBy, bool firstOnly, std::size_t start) {
  using Core = StrCore<Text>;
  using Unit = typename Text::Unit;
  const std::size_t length = Core::Length(buf);
  if (length == 0 || !find || *find == 0 || !replaceBy || start >= length) return 0;
  const std::basic_string_view<Unit> what(find);
  const std::vector<std::size_t> at = FindOccurrences<Text>({buf, length}, what, start, firstOnly);
  if (at.empty()) return 0;

  // A replacement taken from this string's own text must survive the text being rewritten.
  std::basic_string_view<Unit> by(replaceBy);
  std::basic_string<Unit> ownCopy;
  if (std::less_equal<>()(buf, replaceBy) && std::less<>()(replaceBy, buf + length + 1)) {
    ownCopy.assign(by);
    by = ownCopy;
  }
  if (by.size() <= what.size()) {
    ShrinkInPlace(Core::DataForWrite(buf, length), length, at, what.size(), by);
  } else {
    const std::size_t newLength = length + at.size() * (by.size() - what.size());
    GrowInPlace(Core::DataForWrite(buf, newLength), length, at, what.size(), by, newLength);
  }
  return at.size();
}

}  // namespace

std::size_t WStr::Replace(const MCHAR* find, const MCHAR* replaceBy, bool firstOnly, std::size_t start) {
  return ::Replace<WideText>(buf, find, replaceBy, firstOnly, start);
}

std::size_t CStr::Replace(const char* find, const char* replaceBy, bool firstOnly, std::size_t start) {
  return ::Replace<NarrowText>(buf, find, replaceBy, firstOnly, start);
}
