// The tool's table of code-page names and the parsing of --from and --to values.

#include "codepage_names.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <string>

#include "vynutil/vynstring.h"
#include "win32/codepage.h"

namespace vyntool {
namespace {

// Names as the Windows code-page identifiers page and the IANA registry give them.
constexpr CodePageName kNames[] = {
    {"utf-8", CP_UTF8},
    {"utf8", CP_UTF8},
    {"utf-7", CP_UTF7},
    {"utf-16le", CP_UTF16},
    {"utf-16", CP_UTF16},
    {"utf-32le", CP_UTF32},
    {"utf-32", CP_UTF32},
    {"ansi", CP_ACP},
    {"acp", CP_ACP},
    {"oem", CP_OEMCP},
    {"oemcp", CP_OEMCP},
    {"shift_jis", 932},
    {"sjis", 932},
    {"windows-31j", 932},
    {"gbk", 936},
    {"gb2312", 936},
    {"ks_c_5601-1987", 949},
    {"big5", 950},
    {"us-ascii", 20127},
    {"ascii", 20127},
    {"iso-8859-1", 28591},
    {"latin1", 28591},
    {"iso-8859-2", 28592},
    {"iso-8859-5", 28595},
    {"iso-8859-7", 28597},
    {"iso-8859-15", 28605},
    {"koi8-r", 20866},
    {"macintosh", 10000},
};

// Prefixes that put a code-page number after them.
constexpr std::string_view kNumberPrefixes[] = {"cp", "windows-", "ibm"};

// Lower case, '_' read as '-'.
std::string Canonical(std::string_view text) {
  std::string result(text);
  for (char& c : result) {
    c = c == '_' ? '-' : static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  }
  return result;
}

std::optional<UINT> ParseNumber(std::string_view digits) {
  if (digits.empty() || !std::all_of(digits.begin(), digits.end(), [](char c) { return c >= '0' && c <= '9'; })) {
    return std::nullopt;
  }
  UINT value = 0;
  const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), value);
  if (error != std::errc() || end != digits.data() + digits.size()) return std::nullopt;
  return value;
}

std::optional<UINT> LookUp(std::string_view text) {
  if (auto number = ParseNumber(text)) return number;
  const std::string name = Canonical(text);
  for (const CodePageName& entry : kNames) {
    if (Canonical(entry.name) == name) return entry.codepage;
  }
  for (std::string_view prefix : kNumberPrefixes) {
    if (name.starts_with(prefix)) {
      if (auto number = ParseNumber(std::string_view(name).substr(prefix.size()))) return number;
    }
  }
  return std::nullopt;
}

bool IsConvertible(UINT codepage) {
  return codepage == CP_UTF16 || codepage == CP_UTF32 || win32::IsValidCodePage(codepage);
}

}  // namespace

std::span<const CodePageName> CodePageNames() { return kNames; }

std::optional<UINT> ParseCodePage(std::string_view text) {
  const std::optional<UINT> named = LookUp(text);
  if (!named) return std::nullopt;
  const UINT codepage = VynSDK::Util::VynString::NormalizeCP(*named);
  if (!IsConvertible(codepage)) return std::nullopt;
  return codepage;
}

}  // namespace vyntool
