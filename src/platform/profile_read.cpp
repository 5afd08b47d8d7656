// The private-profile read functions: values, lists of names and sections, integers, structs.

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <memory>
#include <new>

#include "profile_cache.h"
#include "profile_document.h"
#include "profile_location.h"
#include "profile_text.h"
#include "profile_values.h"
#include "win32/last_error.h"
#include "win32/profile.h"

namespace win32 {

namespace {

using detail::ProfileDocument;
using detail::ProfileLine;
using detail::ProfileLineKind;
using detail::ProfileSection;
using detail::profile::Text;

// A name argument: without surrounding blanks, as the file's names are.
Text NameArgument(const MCHAR* name) {
  return detail::profile::TrimBlanks(detail::profile::ArgumentText(name));
}

// Copies text cut to size - 1 units and a null; *cut tells whether it was cut. size > 0.
DWORD CopyString(Text text, MCHAR* buffer, DWORD size, bool* cut) {
  const std::size_t length = std::min<std::size_t>(text.size(), size - 1);
  std::copy_n(text.data(), length, buffer);
  buffer[length] = 0;
  *cut = length < text.size();
  return static_cast<DWORD>(length);
}

// Fills a buffer with a list of strings, each ended by a null, the list by a second null, by the
// Windows rule: the list must fit in size - 2 units; one that does not is cut there and ended
// with two nulls, and the result is size - 2 (0 when size < 2). An empty list is one null.
class ListWriter {
 public:
  ListWriter(MCHAR* buffer, DWORD size)
      : buffer_(buffer), size_(size), room_(size >= 2 ? size - 2 : 0) {}

  // Appends to the current string; false once the list no longer fits (add nothing more).
  bool Add(Text piece) {
    const std::size_t length = std::min<std::size_t>(piece.size(), room_ - used_);
    std::copy_n(piece.data(), length, buffer_ + used_);
    used_ += length;
    if (length < piece.size()) cut_ = true;
    return !cut_;
  }
  bool EndString() { return Add(Text(u"", 1)); }

  bool cut() const { return cut_; }

  DWORD Finish() {
    if (!cut_) {
      buffer_[used_] = 0;
      return static_cast<DWORD>(used_);
    }
    if (size_ < 2) {
      buffer_[0] = 0;
      return 0;
    }
    buffer_[size_ - 2] = 0;
    buffer_[size_ - 1] = 0;
    return size_ - 2;
  }

 private:
  MCHAR* buffer_;
  DWORD size_;
  std::size_t room_;
  std::size_t used_ = 0;
  bool cut_ = false;
};

// Empty names are left out of lists: an empty string would end the list early.
bool AddName(ListWriter& list, Text name) {
  return name.empty() || (list.Add(name) && list.EndString());
}

void ListSectionNames(const ProfileDocument& doc, ListWriter& list) {
  for (const ProfileSection& section : doc.sections()) {
    if (!AddName(list, doc.SectionName(section))) return;
  }
}

void ListKeyNames(const ProfileDocument& doc, const ProfileSection& section, ListWriter& list) {
  for (std::uint32_t l = section.header + 1; l < section.end; ++l) {
    const ProfileLine& line = doc.lines()[l];
    if (line.kind == ProfileLineKind::kEntry && !AddName(list, doc.Entry(line).key)) return;
  }
}

// The lines of a section as GetPrivateProfileSectionW returns them.
void ListSectionLines(const ProfileDocument& doc, const ProfileSection& section, ListWriter& list) {
  for (std::uint32_t l = section.header + 1; l < section.end; ++l) {
    const ProfileLine& line = doc.lines()[l];
    bool room;
    if (line.kind == ProfileLineKind::kEntry) {
      const detail::ProfileEntryParts parts = doc.Entry(line);
      room = list.Add(parts.key) && list.Add(u"=") && list.Add(parts.value);
    } else {
      room = list.Add(detail::profile::TrimBlanks(doc.LineText(line)));
    }
    if (!room || !list.EndString()) return;
  }
}

// The file's current document, or null with the reason in *error.
std::shared_ptr<const ProfileDocument> ReadDocument(const MCHAR* fileName, DWORD* error) {
  const detail::ProfileRead read = detail::ReadProfile(detail::LocateProfile(fileName).path);
  *error = read.error;
  return read.document;
}

// The section of the document named by the argument, or null with ERROR_FILE_NOT_FOUND.
const ProfileSection* FindSection(const ProfileDocument* doc, const MCHAR* name, DWORD* error) {
  const std::ptrdiff_t found = doc != nullptr ? doc->FindSection(NameArgument(name)) : -1;
  if (found < 0) {
    if (doc != nullptr) *error = ERROR_FILE_NOT_FOUND;
    return nullptr;
  }
  return &doc->sections()[static_cast<std::size_t>(found)];
}

// A value looked up by section and key: the document holds the text the view points into.
struct ValueLookup {
  std::shared_ptr<const ProfileDocument> doc;
  Text value;
  bool found = false;
  DWORD error = ERROR_SUCCESS;
};

ValueLookup LookUpValue(const MCHAR* section, const MCHAR* key, const MCHAR* fileName) {
  ValueLookup lookup;
  lookup.doc = ReadDocument(fileName, &lookup.error);
  const ProfileSection* found = FindSection(lookup.doc.get(), section, &lookup.error);
  if (found == nullptr) return lookup;
  const std::ptrdiff_t line = lookup.doc->FindEntry(
      static_cast<std::size_t>(found - lookup.doc->sections().data()), NameArgument(key));
  if (line < 0) {
    lookup.error = ERROR_FILE_NOT_FOUND;
    return lookup;
  }
  lookup.value = detail::profile::StripQuotes(
      lookup.doc->Entry(lookup.doc->lines()[static_cast<std::size_t>(line)]).value);
  lookup.found = true;
  return lookup;
}

// The names GetPrivateProfileStringW lists for a null section or key.
DWORD ListNames(const MCHAR* section, MCHAR* buffer, DWORD size, const MCHAR* fileName,
                DWORD* error) {
  ListWriter list(buffer, size);
  std::shared_ptr<const ProfileDocument> doc = ReadDocument(fileName, error);
  if (section == nullptr) {
    if (doc) ListSectionNames(*doc, list);
  } else if (const ProfileSection* found = FindSection(doc.get(), section, error)) {
    ListKeyNames(*doc, *found, list);
  }
  if (list.cut()) *error = ERROR_MORE_DATA;
  return list.Finish();
}

DWORD Finish(DWORD result, DWORD error) {
  SetLastError(error);
  return result;
}

}  // namespace

DWORD GetPrivateProfileStringW(LPCWSTR lpAppName, LPCWSTR lpKeyName, LPCWSTR lpDefault,
                               LPWSTR lpReturnedString, DWORD nSize, LPCWSTR lpFileName) {
  if (nSize == 0) return 0;
  if (lpReturnedString == nullptr) return Finish(0, ERROR_INVALID_PARAMETER);
  try {
    DWORD error = ERROR_SUCCESS;
    if (lpAppName == nullptr || lpKeyName == nullptr) {
      const DWORD result = ListNames(lpAppName, lpReturnedString, nSize, lpFileName, &error);
      return Finish(result, error);
    }
    const ValueLookup lookup = LookUpValue(lpAppName, lpKeyName, lpFileName);
    bool cut = false;
    if (!lookup.found) {
      const Text fallback =
          detail::profile::TrimTrailingSpaces(detail::profile::ArgumentText(lpDefault));
      return Finish(CopyString(fallback, lpReturnedString, nSize, &cut), lookup.error);
    }
    const DWORD result = CopyString(lookup.value, lpReturnedString, nSize, &cut);
    return Finish(result, cut ? ERROR_MORE_DATA : ERROR_SUCCESS);
  } catch (const std::bad_alloc&) {
    lpReturnedString[0] = 0;
    return Finish(0, ERROR_NOT_ENOUGH_MEMORY);
  }
}

UINT GetPrivateProfileIntW(LPCWSTR lpAppName, LPCWSTR lpKeyName, INT nDefault,
                           LPCWSTR lpFileName) {
  const UINT fallback = static_cast<UINT>(nDefault);
  try {
    if (lpAppName == nullptr || lpKeyName == nullptr) {
      // Windows converts whatever the string call gives: here the first name of the list.
      MCHAR first[64];
      DWORD error = ERROR_SUCCESS;
      const DWORD listed = ListNames(lpAppName, first, static_cast<DWORD>(std::size(first)),
                                     lpFileName, &error);
      SetLastError(error);
      return listed == 0 ? fallback : detail::profile::ParseInteger(first);
    }
    const ValueLookup lookup = LookUpValue(lpAppName, lpKeyName, lpFileName);
    SetLastError(lookup.error);
    if (!lookup.found || lookup.value.empty()) return fallback;
    return detail::profile::ParseInteger(lookup.value);
  } catch (const std::bad_alloc&) {
    SetLastError(ERROR_NOT_ENOUGH_MEMORY);
    return fallback;
  }
}

DWORD GetPrivateProfileSectionW(LPCWSTR lpAppName, LPWSTR lpReturnedString, DWORD nSize,
                                LPCWSTR lpFileName) {
  if (lpAppName == nullptr || lpReturnedString == nullptr || nSize == 0) {
    return Finish(0, ERROR_INVALID_PARAMETER);
  }
  try {
    DWORD error = ERROR_SUCCESS;
    std::shared_ptr<const ProfileDocument> doc = ReadDocument(lpFileName, &error);
    ListWriter list(lpReturnedString, nSize);
    if (const ProfileSection* found = FindSection(doc.get(), lpAppName, &error)) {
      ListSectionLines(*doc, *found, list);
    }
    if (list.cut()) error = ERROR_MORE_DATA;
    return Finish(list.Finish(), error);
  } catch (const std::bad_alloc&) {
    lpReturnedString[0] = 0;
    return Finish(0, ERROR_NOT_ENOUGH_MEMORY);
  }
}

DWORD GetPrivateProfileSectionNamesW(LPWSTR lpszReturnBuffer, DWORD nSize, LPCWSTR lpFileName) {
  if (nSize == 0) return 0;
  if (lpszReturnBuffer == nullptr) return Finish(0, ERROR_INVALID_PARAMETER);
  try {
    DWORD error = ERROR_SUCCESS;
    const DWORD result = ListNames(nullptr, lpszReturnBuffer, nSize, lpFileName, &error);
    return Finish(result, error);
  } catch (const std::bad_alloc&) {
    lpszReturnBuffer[0] = 0;
    return Finish(0, ERROR_NOT_ENOUGH_MEMORY);
  }
}

BOOL GetPrivateProfileStructW(LPCWSTR lpszSection, LPCWSTR lpszKey, void* lpStruct,
                              UINT uSizeStruct, LPCWSTR szFile) {
  if (lpszSection == nullptr || lpszKey == nullptr || (lpStruct == nullptr && uSizeStruct != 0)) {
    SetLastError(ERROR_INVALID_PARAMETER);
    return FALSE;
  }
  try {
    const ValueLookup lookup = LookUpValue(lpszSection, lpszKey, szFile);
    const DWORD error = detail::profile::DecodeStruct(lookup.value, lpStruct, uSizeStruct);
    SetLastError(error);
    return error == ERROR_SUCCESS ? TRUE : FALSE;
  } catch (const std::bad_alloc&) {
    SetLastError(ERROR_NOT_ENOUGH_MEMORY);
    return FALSE;
  }
}

}  // namespace win32
