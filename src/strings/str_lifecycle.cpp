// CStr, WStr and UTF8Str: construction, assignment and destruction.

#include <utility>

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

// ---- WStr -----------------------------------------------------------------------------------

WStr::WStr(const WStr& other) noexcept : buf(WideCore::Share(other.buf)) {}
WStr::WStr(WStr&& other) noexcept : buf(std::exchange(other.buf, nullptr)) {}
WStr::WStr(const VynString& s) : buf(WideCore::FormOf(s)) {}
WStr::WStr(const VynStringCast<MCHAR>& s) : buf(WideCore::FormOf(s.String())) {}
WStr::WStr(const MCHAR* s) : buf(WideCore::NewText(s)) {}
WStr::~WStr() { WideCore::Release(buf); }

WStr& WStr::operator=(const WStr& other) noexcept {
  if (buf != other.buf) WideCore::Replace(buf, WideCore::Share(other.buf));
  return *this;
}
WStr& WStr::operator=(WStr&& other) noexcept {
  if (this != &other) WideCore::Replace(buf, std::exchange(other.buf, nullptr));
  return *this;
}
WStr& WStr::operator=(const VynString& s) {
  WideCore::Replace(buf, WideCore::FormOf(s));
  return *this;
}
WStr& WStr::operator=(const VynStringCast<MCHAR>& s) { return *this = s.String(); }
WStr& WStr::operator=(const MCHAR* s) {
  WideCore::Replace(buf, WideCore::NewText(s));
  return *this;
}

// ---- CStr -----------------------------------------------------------------------------------

CStr::CStr(const CStr& other) noexcept : buf(NarrowCore::Share(other.buf)) {}
CStr::CStr(CStr&& other) noexcept : buf(std::exchange(other.buf, nullptr)) {}
CStr::CStr(const VynString& s) : buf(NarrowCore::FormOf(s)) {}
CStr::CStr(const VynStringCast<char>& s) : buf(NarrowCore::FormOf(s.String())) {}
CStr::CStr(const char* s) : buf(NarrowCore::NewText(s)) {}
CStr::~CStr() { NarrowCore::Release(buf); }

CStr& CStr::operator=(const CStr& other) noexcept {
  if (buf != other.buf) NarrowCore::Replace(buf, NarrowCore::Share(other.buf));
  return *this;
}
CStr& CStr::operator=(CStr&& other) noexcept {
  if (this != &other) NarrowCore::Replace(buf, std::exchange(other.buf, nullptr));
  return *this;
}
CStr& CStr::operator=(const VynString& s) {
  NarrowCore::Replace(buf, NarrowCore::FormOf(s));
  return *this;
}
CStr& CStr::operator=(const VynStringCast<char>& s) { return *this = s.String(); }
CStr& CStr::operator=(const char* s) {
  NarrowCore::Replace(buf, NarrowCore::NewText(s));
  return *this;
}

// ---- UTF8Str --------------------------------------------------------------------------------

UTF8Str::UTF8Str(const UTF8Str& other) noexcept : buf(Utf8Core::Share(other.buf)) {}
UTF8Str::UTF8Str(UTF8Str&& other) noexcept : buf(std::exchange(other.buf, nullptr)) {}
UTF8Str::UTF8Str(const VynString& s) : buf(Utf8Core::FormOf(s)) {}
// The cast's characters are copied, not shared: the result is a UTF-8 block of its own.
UTF8Str::UTF8Str(const VynStringCastUTF8& s) : buf(Utf8Core::NewText(s.Get() ? s.Get() : "")) {}
UTF8Str::UTF8Str(const char* s) : buf(Utf8Core::NewText(s)) {}
UTF8Str::~UTF8Str() { Utf8Core::Release(buf); }

UTF8Str& UTF8Str::operator=(const UTF8Str& other) noexcept {
  if (buf != other.buf) Utf8Core::Replace(buf, Utf8Core::Share(other.buf));
  return *this;
}
UTF8Str& UTF8Str::operator=(UTF8Str&& other) noexcept {
  if (this != &other) Utf8Core::Replace(buf, std::exchange(other.buf, nullptr));
  return *this;
}
UTF8Str& UTF8Str::operator=(const VynString& s) {
  Utf8Core::Replace(buf, Utf8Core::FormOf(s));
  return *this;
}
UTF8Str& UTF8Str::operator=(const VynStringCastUTF8& s) {
  Utf8Core::Replace(buf, Utf8Core::NewText(s.Get() ? s.Get() : ""));
  return *this;
}
UTF8Str& UTF8Str::operator=(const char* s) {
  Utf8Core::Replace(buf, Utf8Core::NewText(s));
  return *this;
}
