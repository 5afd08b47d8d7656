// CStr, WStr and UTF8Str: reading the characters, lengths and capacity.

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

// ---- WStr -----------------------------------------------------------------------------------

const MCHAR* WStr::data() const noexcept { return WideCore::Data(buf); }
const MCHAR& WStr::operator[](int i) const { return WideCore::At(buf, i); }
MCHAR& WStr::operator[](int i) { return WideCore::WritableAt(buf, i); }
int WStr::Length() const noexcept { return WideCore::IntLength(buf); }
int WStr::length() const noexcept { return Length(); }
int WStr::ByteCount() const noexcept {
  return static_cast<int>(std::min<std::size_t>(WideCore::Length(buf) * sizeof(MCHAR), INT_MAX));
}
bool WStr::isNull() const noexcept { return WideCore::IsEmpty(buf); }
std::size_t WStr::AllocatedChars() const noexcept { return WideCore::AllocatedChars(buf); }

// ---- CStr -----------------------------------------------------------------------------------

const char* CStr::data() const noexcept { return NarrowCore::Data(buf); }
const char& CStr::operator[](int i) const { return NarrowCore::At(buf, i); }
char& CStr::operator[](int i) { return NarrowCore::WritableAt(buf, i); }
int CStr::Length() const noexcept { return NarrowCore::IntLength(buf); }
int CStr::length() const noexcept { return Length(); }
int CStr::ByteCount() const noexcept { return Length(); }
bool CStr::isNull() const noexcept { return NarrowCore::IsEmpty(buf); }
std::size_t CStr::AllocatedChars() const noexcept { return NarrowCore::AllocatedChars(buf); }

// ---- UTF8Str --------------------------------------------------------------------------------

const char* UTF8Str::data() const noexcept { return Utf8Core::Data(buf); }
int UTF8Str::Length() const noexcept { return Utf8Core::IntLength(buf); }
int UTF8Str::length() const noexcept { return Length(); }
int UTF8Str::ByteCount() const noexcept { return Length(); }
bool UTF8Str::isNull() const noexcept { return Utf8Core::IsEmpty(buf); }
std::size_t UTF8Str::AllocatedChars() const noexcept { return Utf8Core::AllocatedChars(buf); }
