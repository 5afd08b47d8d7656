// Asset identifiers in paths: the host's asset library turns them into file names.

#include "files/path_asset.h"

#include <atomic>
#include <string_view>

#include "vynutil/wstr.h"
#include "win32/guid.h"
#include "win32/module.h"

namespace vyn {
namespace {

using Conversion = WStr (*)(const MCHAR* text);

// The asset library's conversion, once found; written once for the life of the process.
std::atomic<Conversion> conversion{nullptr};

// "{xxxxxxxx-xxxx-xxxx-xxxx-xxxxxxxxxxxx}": 38 characters that read as a class identifier.
bool IsBracedIdentifier(std::u16string_view text) {
  win32::CLSID id;
  return text.size() == 38 && text.front() == u'{' && text.back() == u'}' &&
         win32::CLSIDFromString(text.data(), &id) == win32::NOERROR;
}

// Looks the conversion up in the asset library. The library stays loaded once the conversion is
// found, so the function it gives stays callable; it is released when it does not offer one.
Conversion FindConversion() {
  HMODULE library = win32::LoadLibraryExW(kAssetLibraryName, nullptr, 0);
  if (!library) return nullptr;
  auto found = reinterpret_cast<Conversion>(reinterpret_cast<void*>(
      win32::GetProcAddress(library, "ConvertFileNameOrAssetIDStringToFileName")));
  if (!found) win32::FreeLibrary(library);
  return found;
}

}  // namespace

std::u16string StoredPathText(const MCHAR* text) {
  if (!text) return {};
  const std::u16string_view view(text);
  Conversion convert = conversion.load(std::memory_order_acquire);
  if (!convert && IsBracedIdentifier(view)) {
    convert = FindConversion();
    if (convert) conversion.store(convert, std::memory_order_release);
  }
  if (!convert) return std::u16string(view);
  const WStr converted = convert(text);
  return converted.data() ? std::u16string(converted.data(), static_cast<std::size_t>(converted.Length()))
                          : std::u16string();
}

}  // namespace vyn
