// The lead bytes of a narrow code page, read once per walk from the code page's description.

#include "strings/str_characters.h"

#include "win32/codepage.h"

namespace VynSDK::Util::StrClass {

NarrowCharacters::NarrowCharacters(UINT codePage) : codePage_(codePage) {
  win32::CPINFO info{};
  if (!win32::GetCPInfo(codePage, &info)) return;
  // LeadByte holds pairs of inclusive ranges, ended by a pair of zero bytes.
  for (UINT i = 0; i + 1 < win32::MAX_LEADBYTES && info.LeadByte[i] != 0; i += 2) {
    for (unsigned b = info.LeadByte[i]; b <= info.LeadByte[i + 1]; ++b) lead_[b] = true;
  }
}

}  // namespace VynSDK::Util::StrClass
