#pragma once
// Values of a profile with a meaning beyond text: integers as GetPrivateProfileIntW reads them,
// and the checksummed hexadecimal form of GetPrivateProfileStructW / WritePrivateProfileStructW.

#include <string>

#include "profile_text.h"
#include "vynutil/wintypes.h"

namespace win32::detail::profile {

// The number in text as RtlUnicodeStringToInteger reads it with base 0: characters up to ' '
// skipped, an optional sign, "0x" / "0o" / "0b" for hexadecimal, octal, binary (either case),
// digits up to the first that is none, modulo 2^32, negated after a '-'. 0 without digits.
UINT ParseInteger(Text text);

// bytes as two upper-case hexadecimal digits each, then the checksum (their sum modulo 256).
// Throws std::bad_alloc for sizes memory cannot hold.
std::u16string EncodeStruct(const void* bytes, UINT size);

// Checks and decodes text made by EncodeStruct into size bytes at out. ERROR_SUCCESS;
// ERROR_BAD_LENGTH when text has not 2 * (size + 1) units; ERROR_INVALID_DATA for a unit that is
// no hexadecimal digit or a wrong checksum (out untouched then).
DWORD DecodeStruct(Text text, void* out, UINT size);

}  // namespace win32::detail::profile
