// Char classification and case mapping, as the Windows runtime's isw* and tow* functions give
// them, by whole code point.

#include "vynutil/char.h"

#include "win32/crt_ctype.h"

namespace VynSDK::Util {

namespace {

// A lead surrogate cannot stand for a character on its own.
unsigned int UnlessLeadSurrogate(std::uint32_t c) { return c >= 0xD800 && c <= 0xDBFF ? '?' : c; }

}  // namespace

bool Char::IsAlpha() const noexcept { return win32::iswalpha(m_code) != 0; }

bool Char::IsAlphaNumeric() const noexcept { return win32::iswalnum(m_code) != 0; }

bool Char::IsDigit() const noexcept { return win32::iswdigit(m_code) != 0; }

bool Char::IsPunctuation() const noexcept { return win32::iswpunct(m_code) != 0; }

bool Char::IsSpace() const noexcept { return win32::iswspace(m_code) != 0; }

Char Char::ToUpper() const noexcept { return Char(UnlessLeadSurrogate(win32::towupper(m_code))); }

Char Char::ToLower() const noexcept { return Char(UnlessLeadSurrogate(win32::towlower(m_code))); }

}  // namespace VynSDK::Util
