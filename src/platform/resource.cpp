// String and binary resources from the tables modules register, in the language Windows would
// choose for the calling thread.

#include "win32/resource.h"

#include <algorithm>
#include <cstring>

#include "resource_registry.h"
#include "win32/crt_string.h"
#include "win32/language.h"
#include "win32/last_error.h"
#include "win32/module.h"

namespace win32 {

namespace {

constexpr LANGID kEnglishUnitedStates = 0x0409;
constexpr int kLastRank = 4;

LANGID PrimaryLanguage(LANGID language) { return language & 0x3FF; }

// How early a table of language comes in Windows' search for the thread's language: the
// language itself, the same primary language, neutral, English (United States), any other.
int Rank(LANGID language, LANGID wanted) {
  if (language == wanted) return 0;
  if (PrimaryLanguage(language) == 0) return 2;
  if (PrimaryLanguage(language) == PrimaryLanguage(wanted)) return 1;
  if (language == kEnglishUnitedStates) return 3;
  return kLastRank;
}

// The first entry that find gives, trying the module's tables in language order.
template <typename Entry, typename Find>
const Entry* InLanguageOrder(const VynModuleResources& resources, Find find) {
  const LANGID wanted = GetThreadUILanguage();
  for (int rank = 0; rank <= kLastRank; ++rank) {
    for (std::size_t i = 0; i < resources.languageCount; ++i) {
      const VynResourceLanguage& language = resources.languages[i];
      if (Rank(language.language, wanted) != rank) continue;
      if (const Entry* entry = find(language)) return entry;
    }
  }
  return nullptr;
}

const VynStringResource* FindString(const VynModuleResources& resources, UINT id) {
  // String numbers are 16 bits, as in a Windows string table.
  const UINT number = id & 0xFFFF;
  return InLanguageOrder<VynStringResource>(resources, [number](const VynResourceLanguage& table) {
    for (std::size_t i = 0; i < table.stringCount; ++i) {
      const VynStringResource& entry = table.strings[i];
      if (entry.id == number && entry.text != nullptr && entry.text[0] != 0) return &entry;
    }
    return static_cast<const VynStringResource*>(nullptr);
  });
}

const VynDataResource* FindData(const VynModuleResources& resources, UINT type, UINT id) {
  return InLanguageOrder<VynDataResource>(resources, [type, id](const VynResourceLanguage& table) {
    for (std::size_t i = 0; i < table.dataCount; ++i) {
      const VynDataResource& entry = table.data[i];
      if (entry.type == type && entry.id == id) return &entry;
    }
    return static_cast<const VynDataResource*>(nullptr);
  });
}

bool HasType(const VynModuleResources& resources, UINT type) {
  for (std::size_t i = 0; i < resources.languageCount; ++i) {
    const VynResourceLanguage& table = resources.languages[i];
    for (std::size_t j = 0; j < table.dataCount; ++j) {
      if (table.data[j].type == type) return true;
    }
  }
  return false;
}

UINT NumberOf(LPCWSTR nameOrType) {
  return static_cast<UINT>(reinterpret_cast<ULONG_PTR>(nameOrType));
}

template <typename Result>
Result Fail(DWORD error, Result result) {
  SetLastError(error);
  return result;
}

const VynDataResource* CheckedEntry(HRSRC resource) {
  const auto* entry = reinterpret_cast<const VynDataResource*>(resource);
  return entry != nullptr && detail::IsRegisteredDataResource(entry) ? entry : nullptr;
}

}  // namespace

int LoadStringW(HINSTANCE module, UINT id, MCHAR* buffer, int bufferMax) {
  if (buffer == nullptr || bufferMax < 0) return Fail(ERROR_INVALID_PARAMETER, 0);
  const VynModuleResources* resources = module != nullptr ? detail::ResourcesOf(module) : nullptr;
  const VynStringResource* entry = resources != nullptr ? FindString(*resources, id) : nullptr;
  if (entry == nullptr) {
    if (bufferMax > 0) buffer[0] = 0;
    return Fail(
        resources != nullptr ? ERROR_RESOURCE_NAME_NOT_FOUND : ERROR_RESOURCE_DATA_NOT_FOUND, 0);
  }
  const std::size_t length = wcslen(entry->text);
  if (bufferMax == 0) {
    *reinterpret_cast<const MCHAR**>(buffer) = entry->text;
    return static_cast<int>(length);
  }
  const std::size_t copied = std::min(length, static_cast<std::size_t>(bufferMax) - 1);
  std::memcpy(buffer, entry->text, copied * sizeof(MCHAR));
  buffer[copied] = 0;
  return static_cast<int>(copied);
}

HRSRC FindResourceW(HMODULE module, LPCWSTR name, LPCWSTR type) {
  if (!IS_INTRESOURCE(type)) return Fail<HRSRC>(ERROR_RESOURCE_TYPE_NOT_FOUND, nullptr);
  if (!IS_INTRESOURCE(name)) return Fail<HRSRC>(ERROR_RESOURCE_NAME_NOT_FOUND, nullptr);
  if (module == nullptr) module = GetModuleHandleW(nullptr);
  const VynModuleResources* resources = detail::ResourcesOf(module);
  if (resources == nullptr) return Fail<HRSRC>(ERROR_RESOURCE_DATA_NOT_FOUND, nullptr);
  const VynDataResource* entry = FindData(*resources, NumberOf(type), NumberOf(name));
  if (entry != nullptr) return reinterpret_cast<HRSRC>(const_cast<VynDataResource*>(entry));
  return Fail<HRSRC>(HasType(*resources, NumberOf(type)) ? ERROR_RESOURCE_NAME_NOT_FOUND
                                                         : ERROR_RESOURCE_TYPE_NOT_FOUND,
                     nullptr);
}

HGLOBAL LoadResource(HMODULE, HRSRC resource) {
  const VynDataResource* entry = CheckedEntry(resource);
  if (entry == nullptr) return Fail<HGLOBAL>(ERROR_INVALID_HANDLE, nullptr);
  return const_cast<void*>(entry->data);
}

DWORD SizeofResource(HMODULE, HRSRC resource) {
  const VynDataResource* entry = CheckedEntry(resource);
  if (entry == nullptr) return Fail<DWORD>(ERROR_INVALID_HANDLE, 0);
  return entry->size;
}

void* LockResource(HGLOBAL data) { return data; }

}  // namespace win32
