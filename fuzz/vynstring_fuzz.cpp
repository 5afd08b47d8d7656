// VynString on arbitrary input: any primary encoding, every form asked for, compared and joined.
// Checks that forms are terminated, that Unicode forms agree with each other, and that nothing
// reads or writes out of bounds.

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <vector>

#include "vynutil/vynstring.h"

using VynSDK::Util::VynString;

namespace {

const UINT kEncodings[] = {CP_UTF8, CP_UTF16, CP_UTF32, CP_NEUTRAL, 1252, 932, 936, 949, 950, 1251, 437, 50222};

VynString Make(UINT encoding, const uint8_t* data, size_t size) {
  switch (encoding) {
    case CP_UTF16: {
      // One unit more than the input fills, so that even empty input has a (non-null) text.
      std::vector<MCHAR> units(size / 2 + 1);
      std::memcpy(units.data(), data, size / 2 * 2);
      return VynString::FromUTF16(units.data(), size / 2);
    }
    case CP_UTF32: {
      std::vector<unsigned int> units(size / 4 + 1);
      std::memcpy(units.data(), data, size / 4 * 4);
      return VynString::FromUTF32(units.data(), size / 4);
    }
    default: return VynString::FromCP(encoding, reinterpret_cast<const char*>(data), size);
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size < 2) return 0;
  UINT primary = kEncodings[data[0] % std::size(kEncodings)];
  UINT other = kEncodings[data[1] % std::size(kEncodings)];
  VynString s = Make(primary, data + 2, size - 2);

  std::size_t len16 = 0, len8 = 0, len32 = 0, lenOther = 0;
  const MCHAR* w = s.ToUTF16(&len16);
  const char* u8 = s.ToUTF8(&len8);
  const unsigned int* u32 = s.ToUTF32(&len32);
  const char* cp = s.ToCP(other == CP_UTF16 || other == CP_UTF32 ? CP_ACP : other, &lenOther);
  if (w[len16] != 0 || u8[len8] != 0 || u32[len32] != 0 || cp[lenOther] != 0) abort();

  // The UTF-8 form made from UTF-16 text reads back to the same UTF-16 text, unless the text had
  // unpaired surrogates (which UTF-8 cannot carry).
  VynString back = VynString::FromUTF8(u8, len8);
  std::size_t backLen = 0;
  const MCHAR* wb = back.ToUTF16(&backLen);
  bool paired = true;
  for (std::size_t i = 0; i < len16; ++i) {
    MCHAR u = w[i];
    if (u >= 0xD800 && u <= 0xDBFF && i + 1 < len16 && w[i + 1] >= 0xDC00 && w[i + 1] <= 0xDFFF) {
      ++i;
    } else if (u >= 0xD800 && u <= 0xDFFF) {
      paired = false;
    }
  }
  if (paired && (backLen != len16 || std::memcmp(wb, w, len16 * 2) != 0)) abort();

  VynString t = Make(other, data + 2, (size - 2) / 2);
  int order = s.Compare(t);
  if ((order < 0) != (t.Compare(s) > 0) && order != 0) abort();
  (void)s.CompareIgnoreCase(t);
  VynString joined = s + t;
  (void)joined.Length(CP_UTF16);
  return 0;
}
