// CStr and WStr: removing text, from a position to the end or a run of units.

#include <algorithm>
#include <string>

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

// Cuts the text at pos; a double-byte character that pos falls inside goes too. The write asks
// for room for the whole text: the capacity of a block counts the units of its primary form,
// which may be fewer than this form's (a narrow form of UTF-16 text in a double-byte code page,
// a UTF-16 form of UTF-32 text), so "the current capacity" could cut the text short first.
template <class Text>
void Cut(typename Text::Unit*& buf, int pos) {
  using Core = StrCore<Text>;
  const std::size_t length = Core::Length(buf);
  if (pos < 0 || static_cast<std::size_t>(pos) >= length) return;
  const std::size_t at = CharacterStartAtOrBefore(Text::Characters(), buf, static_cast<std::size_t>(pos));
  Core::DataForWrite(buf, length)[at] = 0;
}

// Takes count units out at pos into a new block; double-byte characters that either end of the
// run falls inside go too.
template <class Text>
void RemoveRun(typename Text::Unit*& buf, int pos, int count) {
  using Core = StrCore<Text>;
  using Unit = typename Text::Unit;
  if (!buf || pos < 0 || count < 0) return;
  const std::size_t length = Core::Length(buf);
  const auto from = static_cast<std::size_t>(pos);
  if (from > length) return;
  auto n = static_cast<std::size_t>(count);
  if (n > length - from) {
    if (from == length) return;
    n = length - from;
  }
  const auto chars = Text::Characters();
  const std::size_t begin = CharacterStartAtOrBefore(chars, buf, from);
  const std::size_t end = CharacterStartAtOrAfter(chars, buf, from + n);
  const std::size_t kept = length - (end - begin);
  Unit* fresh = Core::NewBuffer(std::max(Core::AllocatedChars(buf), kept + 1));
  std::char_traits<Unit>::copy(fresh, buf, begin);
  std::char_traits<Unit>::copy(fresh + begin, buf + end, length - end + 1);
  Core::Replace(buf, fresh);
}

}  // namespace

WStr& WStr::remove(int pos) {
  Cut<WideText>(buf, pos);
  return *this;
}
WStr& WStr::remove(int pos, int count) {
  RemoveRun<WideText>(buf, pos, count);
  return *this;
}

CStr& CStr::remove(int pos) {
  Cut<NarrowText>(buf, pos);
  return *this;
}
CStr& CStr::remove(int pos, int count) {
  RemoveRun<NarrowText>(buf, pos, count);
  return *this;
}
