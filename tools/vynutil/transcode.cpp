// Conversion between code pages, one NUL-free piece at a time.

#include "transcode.h"

#include <algorithm>
#include <cstring>
#include <vector>

#include "vynutil/vynstring.h"

namespace vyntool {
namespace {

using VynSDK::Util::VynString;

std::size_t UnitSize(UINT codepage) {
  if (codepage == CP_UTF16) return sizeof(MCHAR);
  if (codepage == CP_UTF32) return sizeof(unsigned int);
  return 1;
}

// The whole units in bytes, copied out so that they are aligned.
template <class Unit>
std::vector<Unit> Units(std::string_view bytes) {
  std::vector<Unit> units(bytes.size() / sizeof(Unit));
  std::memcpy(units.data(), bytes.data(), units.size() * sizeof(Unit));
  return units;
}

// A piece of input without zero units as a string.
VynString Decode(UINT from, std::string_view piece) {
  if (from == CP_UTF16) {
    const std::vector<MCHAR> units = Units<MCHAR>(piece);
    return VynString::FromUTF16(units.data(), units.size());
  }
  if (from == CP_UTF32) {
    const std::vector<unsigned int> units = Units<unsigned int>(piece);
    return VynString::FromUTF32(units.data(), units.size());
  }
  return VynString::FromCP(from, piece.data(), piece.size());
}

void AppendUnits(std::string& out, const void* units, std::size_t bytes) {
  out.append(static_cast<const char*>(units), bytes);
}

void AppendEncoded(const VynString& text, UINT to, std::string& out) {
  std::size_t len = 0;
  if (to == CP_UTF16) {
    const auto units = text.ToUTF16(&len);
    AppendUnits(out, units.Get(), len * sizeof(MCHAR));
  } else if (to == CP_UTF32) {
    const auto units = text.ToUTF32(&len);
    AppendUnits(out, units.Get(), len * sizeof(unsigned int));
  } else {
    const auto chars = text.ToCP(to, &len);
    AppendUnits(out, chars.Get(), len);
  }
}

bool IsZeroUnit(std::string_view bytes, std::size_t at, std::size_t unitSize) {
  return std::all_of(bytes.begin() + at, bytes.begin() + at + unitSize, [](char c) { return c == 0; });
}

// The offset of the first zero unit in [start, end) (offsets that are multiples of unitSize),
// or end when there is none.
std::size_t FindZeroUnit(std::string_view bytes, std::size_t start, std::size_t end, std::size_t unitSize) {
  if (unitSize == 1) return std::min(bytes.find('\0', start), end);
  for (std::size_t at = start; at < end; at += unitSize) {
    if (IsZeroUnit(bytes, at, unitSize)) return at;
  }
  return end;
}

}  // namespace

std::string Transcode(UINT from, UINT to, std::string_view bytes) {
  const std::size_t inUnit = UnitSize(from);
  const std::string zeroOut(UnitSize(to), '\0');
  const std::size_t whole = bytes.size() - bytes.size() % inUnit;
  std::string out;
  out.reserve(bytes.size());
  for (std::size_t start = 0;;) {
    const std::size_t zero = FindZeroUnit(bytes, start, whole, inUnit);
    if (zero > start) AppendEncoded(Decode(from, bytes.substr(start, zero - start)), to, out);
    if (zero == whole) break;
    out += zeroOut;
    start = zero + inUnit;
  }
  if (whole < bytes.size()) AppendEncoded(VynString::FromUTF16(u"\uFFFD", 1), to, out);
  return out;
}

}  // namespace vyntool
