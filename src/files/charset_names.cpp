// The charset-name table and its public lookup.

#include "files/charset_names.h"

#include <array>
#include <string_view>

#include "vynutil/text_file.h"
#include "win32/crt_string.h"

namespace VynSDK::Util::TextFile {

namespace detail {

namespace {

constexpr CharsetName Entry(std::u16string_view name, UINT codepage) {
  return {name.data(), name.size(), codepage};
}

constexpr std::array<CharsetName, 21> kCharsetNames = {
    Entry(u"utf-8", 65001),      Entry(u"windows-1252", 1252), Entry(u"iso-8859-13", 28603),
    Entry(u"iso-8859-15", 28605), Entry(u"iso-8859-1", 28591),  Entry(u"iso-8859-2", 28592),
    Entry(u"iso-8859-3", 28593), Entry(u"iso-8859-4", 28594),  Entry(u"iso-8859-5", 28595),
    Entry(u"iso-8859-6", 28596), Entry(u"iso-8859-7", 28597),  Entry(u"iso-8859-8", 28598),
    Entry(u"iso-8859-9", 28599), Entry(u"koi8-r", 20866),      Entry(u"iso-2022-kr", 50225),
    Entry(u"iso-2022-jp", 50222), Entry(u"shift_jis", 932),    Entry(u"gb2312", 936),
    Entry(u"ks_c_5601", 949),    Entry(u"big5", 950),          Entry(u"utf-16", 65012),
};

}  // namespace

std::span<const CharsetName> CharsetNames() { return kCharsetNames; }

}  // namespace detail

bool GetCodePageNumberFromString(const MCHAR* name, UINT& codepage) {
  if (name == nullptr) return false;
  for (const detail::CharsetName& entry : detail::CharsetNames()) {
    if (win32::_wcsicmp(name, entry.name) == 0) {
      codepage = entry.codepage;
      return true;
    }
  }
  return false;
}

}  // namespace VynSDK::Util::TextFile
