// Char: construction from units, bytes and strings, comparison, and conversion to UTF-16 and
// code pages.

#include "vynutil/char.h"

#include <climits>

#include "strings/utf16_units.h"
#include "win32/codepage.h"
#include "win32/last_error.h"

namespace VynSDK::Util {

namespace {

constexpr unsigned int kReplacement = '?';

// The first character of exactly len bytes in codepage (len is at most 6).
unsigned int ConvertFirstCharacter(UINT codepage, const char* bytes, int len) {
  // UTF-8 gives at most one unit a byte and the double-byte pages at most two units a character,
  // so the units always fit, whatever malformed bytes come in.
  MCHAR units[8];
  int n = win32::MultiByteToWideChar(codepage, 0, bytes, len, units, 7);
  units[n > 0 ? n : 0] = 0;
  return Utf16Units::DecodeFirst(units);
}

// Bytes of the character that s starts in codepage, never counting the terminator.
int CharacterBytes(UINT codepage, const char* s) {
  int len = codepage == CP_UTF8 ? static_cast<int>(Char::UTF8CharLength(static_cast<unsigned char>(s[0])))
            : win32::IsDBCSLeadByteEx(codepage, static_cast<BYTE>(s[0])) ? 2
                                                                          : 1;
  for (int i = 1; i < len; ++i) {
    if (s[i] == '\0') return i;
  }
  return len;
}

int ClampToInt(std::size_t n) { return n > INT_MAX ? INT_MAX : static_cast<int>(n); }

}  // namespace

Char::Char(MCHAR unit) noexcept : m_code(Utf16Units::IsLeadSurrogate(unit) ? kReplacement : unit) {}

Char::Char(const MCHAR* s) noexcept : m_code(s ? Utf16Units::DecodeFirst(s) : 0) {}

Char::Char(char c) : m_code(0) { SetNarrowUnit(c); }

Char::Char(const char* s) : m_code(0) { Set(CP_ACP, s); }

Char::Char(UINT codepage, const char* s) : m_code(0) { Set(codepage, s); }

Char::Char(const VynString& s) : m_code(0) { *this = s; }

Char& Char::operator=(unsigned int codePoint) noexcept {
  m_code = codePoint;
  return *this;
}

Char& Char::operator=(MCHAR unit) noexcept { return *this = Char(unit); }

Char& Char::operator=(const MCHAR* s) noexcept { return *this = Char(s); }

Char& Char::operator=(char c) {
  SetNarrowUnit(c);
  return *this;
}

Char& Char::operator=(const char* s) { return Set(CP_ACP, s); }

Char& Char::operator=(const VynString& s) {
  VynStringCast<MCHAR> units = s.ToUTF16();
  m_code = units.Get() ? Utf16Units::DecodeFirst(units.Get()) : 0;
  return *this;
}

// One byte converted on its own. A lead byte of a double-byte page needs its trail byte, and in
// a UTF-8 process every byte from 0x80 is part of a longer sequence: neither is a character alone.
void Char::SetNarrowUnit(char c) {
  const UINT acp = win32::GetACP();
  const auto byte = static_cast<unsigned char>(c);
  if (win32::IsDBCSLeadByteEx(acp, byte) || (acp == CP_UTF8 && byte >= 0x80)) {
    m_code = kReplacement;
    return;
  }
  m_code = ConvertFirstCharacter(acp, &c, 1);
}

Char& Char::Set(UINT codepage, const char* s) {
  if (s == nullptr) {
    m_code = 0;
    return *this;
  }
  const UINT cp = VynString::NormalizeCP(codepage);
  m_code = ConvertFirstCharacter(cp, s, CharacterBytes(cp, s));
  return *this;
}

bool Char::operator==(char c) const { return m_code == Char(c).m_code; }

bool Char::operator!=(char c) const { return !(*this == c); }

const MCHAR* Char::IsInCharacterSet(const MCHAR* set) const noexcept {
  if (m_code == 0 || set == nullptr) return nullptr;
  MCHAR units[Utf16Units::kMaxUnits];
  const unsigned n = Utf16Units::Encode(m_code, units);
  for (const MCHAR* p = set; *p != 0;) {
    if (p[0] == units[0] && (n == 1 || p[1] == units[1])) return p;
    p += Utf16Units::IsLeadSurrogate(p[0]) && p[1] != 0 ? 2 : 1;
  }
  return nullptr;
}

std::size_t Char::ToUTF16(MCHAR* buf, std::size_t bufLen) const noexcept {
  if (buf == nullptr && bufLen != 0) {
    win32::SetLastError(win32::ERROR_INVALID_PARAMETER);
    return 0;
  }
  return UTF32ToWideChar(&m_code, 1, buf, bufLen);
}

std::size_t Char::ToACP(char* buf, std::size_t bufLen) const noexcept { return ToCP(CP_ACP, buf, bufLen); }

std::size_t Char::ToCP(UINT codepage, char* buf, std::size_t bufLen) const noexcept {
  MCHAR units[Utf16Units::kMaxUnits];
  const unsigned n = Utf16Units::Encode(m_code, units);
  const int written = win32::WideCharToMultiByte(codepage, 0, units, static_cast<int>(n), buf,
                                                 ClampToInt(bufLen), nullptr, nullptr);
  const std::size_t count = written > 0 ? static_cast<std::size_t>(written) : 0;
  if (buf != nullptr && count < bufLen) buf[count] = '\0';
  return count;
}

VynString Char::ToVynString() const {
  MCHAR units[Utf16Units::kMaxUnits];
  const unsigned n = Utf16Units::Encode(m_code, units);
  return VynString::FromUTF16(units, n);
}

}  // namespace VynSDK::Util
