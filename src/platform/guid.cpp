// CLSIDFromString: the braced registry form of a GUID, read strictly.

#include "win32/guid.h"

#include <cstddef>
#include <cstring>

namespace win32 {

namespace {

constexpr std::size_t kTextLength = 38;

int HexValue(OLECHAR c) {
  if (c >= u'0' && c <= u'9') return c - u'0';
  if (c >= u'a' && c <= u'f') return c - u'a' + 10;
  if (c >= u'A' && c <= u'F') return c - u'A' + 10;
  return -1;
}

// The number in digits hexadecimal digits at text, or false.
bool ReadHex(const OLECHAR* text, int digits, unsigned long long* value) {
  *value = 0;
  for (int i = 0; i < digits; ++i) {
    const int digit = HexValue(text[i]);
    if (digit < 0) return false;
    *value = (*value << 4) | static_cast<unsigned>(digit);
  }
  return true;
}

bool Parse(const OLECHAR* text, GUID* guid) {
  // Reading stops at the first character out of place, so a shorter text never reads past its
  // terminator.
  for (std::size_t i = 0; i < kTextLength; ++i) {
    if (text[i] == 0) return false;
  }
  if (text[0] != u'{' || text[9] != u'-' || text[14] != u'-' || text[19] != u'-' ||
      text[24] != u'-' || text[37] != u'}' || text[kTextLength] != 0) {
    return false;
  }
  unsigned long long value = 0;
  if (!ReadHex(text + 1, 8, &value)) return false;
  guid->Data1 = static_cast<DWORD>(value);
  if (!ReadHex(text + 10, 4, &value)) return false;
  guid->Data2 = static_cast<WORD>(value);
  if (!ReadHex(text + 15, 4, &value)) return false;
  guid->Data3 = static_cast<WORD>(value);
  static constexpr int kByteAt[8] = {20, 22, 25, 27, 29, 31, 33, 35};
  for (int i = 0; i < 8; ++i) {
    if (!ReadHex(text + kByteAt[i], 2, &value)) return false;
    guid->Data4[i] = static_cast<BYTE>(value);
  }
  return true;
}

}  // namespace

HRESULT CLSIDFromString(LPCOLESTR lpsz, CLSID* pclsid) {
  if (pclsid == nullptr) return E_INVALIDARG;
  std::memset(pclsid, 0, sizeof *pclsid);
  if (lpsz == nullptr) return NOERROR;
  GUID parsed{};
  if (!Parse(lpsz, &parsed)) return CO_E_CLASSSTRING;
  *pclsid = parsed;
  return NOERROR;
}

}  // namespace win32
