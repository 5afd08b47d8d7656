// CStr, WStr and UTF8Str: write access and resizing.

#include <string>

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

// Exactly n units: the text cut, or padded with spaces; the null string for n <= 0.
template <class Text>
void Resize(typename Text::Unit*& buf, int n) {
  using Core = StrCore<Text>;
  using Unit = typename Text::Unit;
  if (n <= 0) {
    Core::Release(buf);
    return;
  }
  const auto wanted = static_cast<std::size_t>(n);
  const bool hasText = Text::kResizeKeepsEmptyText ? buf != nullptr : !Core::IsEmpty(buf);
  if (hasText) {
    const std::size_t oldLength = Core::Length(buf);
    Unit* out = Core::DataForWrite(buf, wanted);
    if (oldLength < wanted) std::char_traits<Unit>::assign(out + oldLength, wanted - oldLength, Unit(' '));
    out[wanted] = 0;
    return;
  }
  Unit* fresh = Core::NewBuffer(wanted + 1);
  std::char_traits<Unit>::assign(fresh, wanted, Unit(' '));
  fresh[wanted] = 0;
  Core::Replace(buf, fresh);
}

}  // namespace

MCHAR* WStr::dataForWrite(std::size_t n) { return WideCore::DataForWrite(buf, n); }
void WStr::Resize(int n) { ::Resize<WideText>(buf, n); }

char* CStr::dataForWrite(std::size_t n) { return NarrowCore::DataForWrite(buf, n); }
void CStr::Resize(int n) { ::Resize<NarrowText>(buf, n); }

char* UTF8Str::dataForWrite(std::size_t n) { return Utf8Core::DataForWrite(buf, n); }
void UTF8Str::Resize(int n) { ::Resize<Utf8Text>(buf, n); }
