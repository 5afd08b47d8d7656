// CharLowerBuffW over the runtime's simple case mapping of whole characters.

#include "win32/user_text.h"

#include <cstdint>

#include "win32/crt_ctype.h"

namespace win32 {

namespace {

bool IsLead(MCHAR unit) { return unit >= 0xD800 && unit <= 0xDBFF; }
bool IsTrail(MCHAR unit) { return unit >= 0xDC00 && unit <= 0xDFFF; }

}  // namespace

DWORD CharLowerBuffW(LPWSTR lpsz, DWORD cchLength) {
  if (lpsz == nullptr) return 0;
  for (DWORD i = 0; i < cchLength; ++i) {
    const MCHAR unit = lpsz[i];
    if (unit < 0x80) {
      if (unit >= u'A' && unit <= u'Z') lpsz[i] = static_cast<MCHAR>(unit + (u'a' - u'A'));
    } else if (IsLead(unit) && i + 1 < cchLength && IsTrail(lpsz[i + 1])) {
      const std::uint32_t c = 0x10000 + ((unit - 0xD800u) << 10) + (lpsz[i + 1] - 0xDC00u);
      const std::uint32_t lower = towlower(c);
      // Simple mappings of supplementary characters stay supplementary; the check keeps the
      // length fixed whatever the tables say.
      if (lower >= 0x10000) {
        lpsz[i] = static_cast<MCHAR>(0xD800 + ((lower - 0x10000) >> 10));
        lpsz[i + 1] = static_cast<MCHAR>(0xDC00 + ((lower - 0x10000) & 0x3FF));
      }
      ++i;
    } else if (!IsLead(unit) && !IsTrail(unit)) {
      const std::uint32_t lower = towlower(unit);
      if (lower <= 0xFFFF) lpsz[i] = static_cast<MCHAR>(lower);
    }
  }
  return cchLength;
}

}  // namespace win32
