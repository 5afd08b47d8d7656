// CStr, WStr and UTF8Str: the static makers. Each builds a block with the matching VynString
// maker and takes the class's form of it; the makers from another holder share its block.

#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;
using VynSDK::Util::VynString;

// ---- WStr -----------------------------------------------------------------------------------

WStr WStr::FromWStr(const WStr& s) { return s; }
WStr WStr::FromMSTR(const WStr& s) { return s; }
WStr WStr::FromCStr(const CStr& s) {
  WStr result;
  result.buf = WideCore::FormOfBlock(s.buf);
  return result;
}
WStr WStr::FromVynString(const VynString& s) { return WStr(s); }
WStr WStr::FromACP(const char* s, std::size_t len) { return WStr(VynString::FromACP(s, len)); }
WStr WStr::FromCP(UINT codepage, const char* s, std::size_t len) {
  return WStr(VynString::FromCP(codepage, s, len));
}
WStr WStr::FromUTF8(const char* s, std::size_t len) { return WStr(VynString::FromUTF8(s, len)); }
WStr WStr::FromUTF16(const MCHAR* s, std::size_t len) { return WStr(VynString::FromUTF16(s, len)); }
WStr WStr::FromBSTR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
WStr WStr::FromOLESTR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
WStr WStr::FromMCHAR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
WStr WStr::FromUTF32(const unsigned int* s, std::size_t len) { return WStr(VynString::FromUTF32(s, len)); }

// ---- CStr -----------------------------------------------------------------------------------

CStr CStr::FromCStr(const CStr& s) { return s; }
CStr CStr::FromWStr(const WStr& s) {
  CStr result;
  result.buf = NarrowCore::FormOfBlock(s.buf);
  return result;
}
CStr CStr::FromMSTR(const WStr& s) { return FromWStr(s); }
CStr CStr::FromVynString(const VynString& s) { return CStr(s); }
CStr CStr::FromACP(const char* s, std::size_t len) { return CStr(VynString::FromACP(s, len)); }
CStr CStr::FromCP(UINT codepage, const char* s, std::size_t len) {
  return CStr(VynString::FromCP(codepage, s, len));
}
CStr CStr::FromUTF8(const char* s, std::size_t len) { return CStr(VynString::FromUTF8(s, len)); }
CStr CStr::FromUTF16(const MCHAR* s, std::size_t len) { return CStr(VynString::FromUTF16(s, len)); }
CStr CStr::FromBSTR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
CStr CStr::FromOLESTR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
CStr CStr::FromMCHAR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
CStr CStr::FromUTF32(const unsigned int* s, std::size_t len) { return CStr(VynString::FromUTF32(s, len)); }

// ---- UTF8Str --------------------------------------------------------------------------------

UTF8Str UTF8Str::FromUTF8Str(const UTF8Str& s) { return s; }
UTF8Str UTF8Str::FromWStr(const WStr& s) {
  UTF8Str result;
  result.buf = Utf8Core::FormOfBlock(s.buf);
  return result;
}
UTF8Str UTF8Str::FromMSTR(const WStr& s) { return FromWStr(s); }
UTF8Str UTF8Str::FromCStr(const CStr& s) {
  UTF8Str result;
  result.buf = Utf8Core::FormOfBlock(s.buf);
  return result;
}
UTF8Str UTF8Str::FromVynString(const VynString& s) { return UTF8Str(s); }
UTF8Str UTF8Str::FromACP(const char* s, std::size_t len) { return UTF8Str(VynString::FromACP(s, len)); }
UTF8Str UTF8Str::FromCP(UINT codepage, const char* s, std::size_t len) {
  return UTF8Str(VynString::FromCP(codepage, s, len));
}
UTF8Str UTF8Str::FromUTF8(const char* s, std::size_t len) { return UTF8Str(VynString::FromUTF8(s, len)); }
UTF8Str UTF8Str::FromUTF16(const MCHAR* s, std::size_t len) { return UTF8Str(VynString::FromUTF16(s, len)); }
UTF8Str UTF8Str::FromBSTR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
UTF8Str UTF8Str::FromOLESTR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
UTF8Str UTF8Str::FromMCHAR(const MCHAR* s, std::size_t len) { return FromUTF16(s, len); }
UTF8Str UTF8Str::FromUTF32(const unsigned int* s, std::size_t len) {
  return UTF8Str(VynString::FromUTF32(s, len));
}
