// CStr, WStr and UTF8Str: toLower and toUpper.
//
// WStr and CStr map their text in place (in a block of their own when it is shared) and keep its
// length; UTF8Str maps a UTF-16 copy and makes the result its new text.

#include "strings/case_mapping.h"
#include "strings/str_core.h"
#include "vynutil/strclass.h"

using namespace VynSDK::Util::StrClass;

namespace {

// Room for the whole text, not "the current capacity": that counts the primary form's units,
// fewer than the UTF-16 units when the block was made from UTF-32 text.
void MapWide(MCHAR*& buf, CaseMapping mapping) {
  if (WideCore::IsEmpty(buf)) return;
  const std::size_t length = WideCore::Length(buf);
  MapCaseUtf16(WideCore::DataForWrite(buf, length), length, mapping);
}

// With a narrow-language locale the runtime asks for room for twice the length, which is what
// the capacity grows to.
void MapNarrow(char*& buf, CaseMapping mapping) {
  if (NarrowCore::IsEmpty(buf)) return;
  const std::size_t length = NarrowCore::Length(buf);
  const std::size_t room = VynSDK::Util::CStrLocale() ? 2 * length : length;
  MapCaseNarrow(NarrowText::Characters(), NarrowCore::DataForWrite(buf, room), mapping);
}

void MapUtf8(char*& buf, CaseMapping mapping) {
  if (Utf8Core::IsEmpty(buf)) return;
  const std::string mapped = MapCaseUtf8(buf, mapping);
  Utf8Core::Replace(buf, Utf8Core::NewText(mapped.data(), mapped.size()));
}

}  // namespace

void WStr::toLower() { MapWide(buf, CaseMapping::kLower); }
void WStr::toUpper() { MapWide(buf, CaseMapping::kUpper); }

void CStr::toLower() { MapNarrow(buf, CaseMapping::kLower); }
void CStr::toUpper() { MapNarrow(buf, CaseMapping::kUpper); }

void UTF8Str::toLower() { MapUtf8(buf, CaseMapping::kLower); }
void UTF8Str::toUpper() { MapUtf8(buf, CaseMapping::kUpper); }
