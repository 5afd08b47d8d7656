// CStr, WStr and UTF8Str: conversions to the other classes, to VynString and to its cast
// holders. All of them share the block; a converted form is made once per block and cached.

#include "strings/str_core.h"
#include "vynutil/strclass.h"
#include "win32/oleaut.h"

using namespace VynSDK::Util::StrClass;
using VynSDK::Util::VynString;

// ---- WStr -----------------------------------------------------------------------------------

WStr WStr::ToWStr() const noexcept { return *this; }
WStr WStr::ToMSTR() const noexcept { return *this; }
CStr WStr::ToCStr() const { return CStr::FromWStr(*this); }
VynString WStr::ToVynString() const { return WideCore::Block(buf); }
void WStr::ToVynString(VynString& out) const { out = WideCore::Block(buf); }
WStr::VynStringCast<char> WStr::ToACP(std::size_t* len) const { return WideCore::Block(buf).ToACP(len); }
WStr::VynStringCastCP WStr::ToCP(UINT codepage, std::size_t* len) const {
  return WideCore::Block(buf).ToCP(codepage, len);
}
WStr::VynStringCastUTF8 WStr::ToUTF8(std::size_t* len) const { return WideCore::Block(buf).ToUTF8(len); }
WStr::VynStringCast<MCHAR> WStr::ToUTF16(std::size_t* len) const { return WideCore::Block(buf).ToUTF16(len); }
WStr::VynStringCast<MCHAR> WStr::ToOLESTR(std::size_t* len) const { return ToUTF16(len); }
WStr::VynStringCast<unsigned int> WStr::ToUTF32(std::size_t* len) const {
  return WideCore::Block(buf).ToUTF32(len);
}
const MCHAR* WStr::ToMCHAR(std::size_t* len) const noexcept {
  if (len) *len = WideCore::Length(buf);
  return WideCore::Data(buf);
}
BSTR WStr::ToBSTR() const { return win32::SysAllocString(WideCore::Data(buf)); }

// ---- CStr -----------------------------------------------------------------------------------

CStr CStr::ToCStr() const noexcept { return *this; }
WStr CStr::ToWStr() const { return WStr::FromCStr(*this); }
WStr CStr::ToMSTR() const { return ToWStr(); }
VynString CStr::ToVynString() const { return NarrowCore::Block(buf); }
void CStr::ToVynString(VynString& out) const { out = NarrowCore::Block(buf); }
CStr::VynStringCast<char> CStr::ToACP(std::size_t* len) const { return NarrowCore::Block(buf).ToACP(len); }
CStr::VynStringCastCP CStr::ToCP(UINT codepage, std::size_t* len) const {
  return NarrowCore::Block(buf).ToCP(codepage, len);
}
CStr::VynStringCastUTF8 CStr::ToUTF8(std::size_t* len) const { return NarrowCore::Block(buf).ToUTF8(len); }
CStr::VynStringCast<MCHAR> CStr::ToUTF16(std::size_t* len) const {
  return NarrowCore::Block(buf).ToUTF16(len);
}
CStr::VynStringCast<MCHAR> CStr::ToOLESTR(std::size_t* len) const { return ToUTF16(len); }
CStr::VynStringCast<MCHAR> CStr::ToMCHAR(std::size_t* len) const { return ToUTF16(len); }
CStr::VynStringCast<unsigned int> CStr::ToUTF32(std::size_t* len) const {
  return NarrowCore::Block(buf).ToUTF32(len);
}
BSTR CStr::ToBSTR() const { return NarrowCore::Block(buf).ToBSTR(); }

// ---- UTF8Str --------------------------------------------------------------------------------

UTF8Str UTF8Str::ToUTF8Str() const noexcept { return *this; }
WStr UTF8Str::ToWStr() const {
  WStr result;
  result.buf = WideCore::FormOfBlock(buf);
  return result;
}
WStr UTF8Str::ToMSTR() const { return ToWStr(); }
CStr UTF8Str::ToCStr() const {
  CStr result;
  result.buf = NarrowCore::FormOfBlock(buf);
  return result;
}
VynString UTF8Str::ToVynString() const { return Utf8Core::Block(buf); }
void UTF8Str::ToVynString(VynString& out) const { out = Utf8Core::Block(buf); }
UTF8Str::VynStringCast<char> UTF8Str::ToACP(std::size_t* len) const { return Utf8Core::Block(buf).ToACP(len); }
UTF8Str::VynStringCastCP UTF8Str::ToCP(UINT codepage, std::size_t* len) const {
  return Utf8Core::Block(buf).ToCP(codepage, len);
}
UTF8Str::VynStringCastUTF8 UTF8Str::ToUTF8(std::size_t* len) const { return Utf8Core::Block(buf).ToUTF8(len); }
UTF8Str::VynStringCast<MCHAR> UTF8Str::ToUTF16(std::size_t* len) const {
  return Utf8Core::Block(buf).ToUTF16(len);
}
UTF8Str::VynStringCast<MCHAR> UTF8Str::ToOLESTR(std::size_t* len) const { return ToUTF16(len); }
UTF8Str::VynStringCast<MCHAR> UTF8Str::ToMCHAR(std::size_t* len) const { return ToUTF16(len); }
UTF8Str::VynStringCast<unsigned int> UTF8Str::ToUTF32(std::size_t* len) const {
  return Utf8Core::Block(buf).ToUTF32(len);
}
BSTR UTF8Str::ToBSTR() const { return Utf8Core::Block(buf).ToBSTR(); }
