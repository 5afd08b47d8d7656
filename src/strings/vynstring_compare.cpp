// VynString ordering and the choice of a common lossless encoding.

#include <cstring>

#include "strings/vynstring_data.h"
#include "win32/crt_string.h"

namespace VynSDK::Util {

namespace SB = StringBlocks;

UINT VynString::CommonLosslessCP(UINT a, UINT b) noexcept {
  if (a == b) return a;
  if (a == CP_UTF16 || b == CP_UTF16) return CP_UTF16;
  if (a == CP_NEUTRAL) return b;
  if (b == CP_NEUTRAL) return a;
  return CP_UTF16;
}

UINT VynString::CommonLosslessCP(const VynString& other) const noexcept {
  if (!m_data && !other.m_data) return 0;
  if (!m_data) return other.m_data->primary.Encoding();
  if (!other.m_data) return m_data->primary.Encoding();
  return CommonLosslessCP(m_data->primary.Encoding(), other.m_data->primary.Encoding());
}

namespace {

// Compares zero-terminated units as unsigned values, up to the terminator of a: -1, 0 or 1.
template <class Unit>
int CompareUnits(const Unit* a, const Unit* b) noexcept {
  for (;; ++a, ++b) {
    if (*a != *b) return *a < *b ? -1 : 1;
    if (*a == 0) return 0;
  }
}

int CompareForms(const char* a, const char* b, UINT encoding) noexcept {
  switch (encoding) {
    case CP_UTF16: return CompareUnits(reinterpret_cast<const MCHAR*>(a), reinterpret_cast<const MCHAR*>(b));
    case CP_UTF32:
      return CompareUnits(reinterpret_cast<const unsigned int*>(a), reinterpret_cast<const unsigned int*>(b));
    default: return CompareUnits(reinterpret_cast<const unsigned char*>(a), reinterpret_cast<const unsigned char*>(b));
  }
}

int CompareFormsIgnoreCase(VynStringData* a, VynStringData* b, UINT encoding) {
  if (encoding == CP_UTF16 || encoding == CP_UTF32) {
    // UTF-32 text is folded through its UTF-16 form, where the case mapping works.
    auto* wa = reinterpret_cast<const MCHAR*>(SB::FindOrMakeForm(a, CP_UTF16)->Chars());
    auto* wb = reinterpret_cast<const MCHAR*>(SB::FindOrMakeForm(b, CP_UTF16)->Chars());
    return win32::_wcsicmp(wa, wb);
  }
  return win32::_stricmp(SB::FindOrMakeForm(a, encoding)->Chars(), SB::FindOrMakeForm(b, encoding)->Chars());
}

// The null rules shared by both comparisons: true when they decide, with the result in out.
bool CompareNulls(const VynString& a, const VynString& b, int& out) noexcept {
  if (!a.IsNull() && !b.IsNull()) return false;
  out = a.IsNull() ? (b.IsNull() ? 0 : -1) : 1;
  return true;
}

}  // namespace

int VynString::Compare(const VynString& other) const {
  int result;
  if (CompareNulls(*this, other, result)) return result;
  UINT common = CommonLosslessCP(other);
  return CompareForms(SB::FindOrMakeForm(m_data, common)->Chars(),
                      SB::FindOrMakeForm(other.m_data, common)->Chars(), common);
}

int VynString::CompareIgnoreCase(const VynString& other) const {
  int result;
  if (CompareNulls(*this, other, result)) return result;
  return CompareFormsIgnoreCase(m_data, other.m_data, CommonLosslessCP(other));
}

}  // namespace VynSDK::Util
