// VynString concatenation in the two strings' common lossless encoding.

#include <cstring>

#include "strings/string_errors.h"
#include "strings/vynstring_data.h"

namespace VynSDK::Util {

namespace SB = StringBlocks;

VynString& VynString::operator+=(const VynString& other) {
  if (!other.m_data) return *this;
  if (!m_data) return *this = other;
  UINT common = CommonLosslessCP(other);
  EncodedForm* mine = SB::FindOrMakeForm(m_data, common);
  EncodedForm* theirs = SB::FindOrMakeForm(other.m_data, common);
  if (!mine || !theirs) ThrowConcatenationOfNull();
  std::size_t unit = SB::UnitSize(common);
  std::size_t myLen = SB::UnitLength(mine->Chars(), unit);
  std::size_t theirLen = SB::UnitLength(theirs->Chars(), unit);
  // Room for both texts and one terminator. UTF-32 text stays UTF-32, unit by unit.
  VynStringData* joined = SB::Allocate(common, (myLen + 1 + theirLen) * unit);
  char* out = joined->primary.Chars();
  std::memcpy(out, mine->Chars(), myLen * unit);
  std::memcpy(out + myLen * unit, theirs->Chars(), theirLen * unit);
  std::memset(out + (myLen + theirLen) * unit, 0, unit);
  return *this = joined;
}

VynString VynString::operator+(const VynString& other) const {
  VynString result(*this);
  result += other;
  return result;
}

}  // namespace VynSDK::Util
