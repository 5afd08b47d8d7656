// System strings (BSTR) in the Windows layout: a 32-bit byte length, the UTF-16 text, then one
// zero unit. The BSTR points at the text; the block, length prefix included, comes from malloc.

#include "win32/oleaut.h"

#include <cstdint>
#include <cstdlib>
#include <cstring>

#include "win32/crt_string.h"

namespace win32 {

namespace {

constexpr std::size_t kPrefixBytes = sizeof(UINT);

UINT* PrefixOf(BSTR bstr) { return reinterpret_cast<UINT*>(bstr) - 1; }

}  // namespace

BSTR SysAllocString(const OLECHAR* psz) {
  if (psz == nullptr) return nullptr;
  const std::size_t units = wcslen(psz);
  if (units > UINT32_MAX / sizeof(OLECHAR)) return nullptr;
  return SysAllocStringLen(psz, static_cast<UINT>(units));
}

BSTR SysAllocStringLen(const OLECHAR* strIn, UINT len) {
  // The byte length must fit the 32-bit prefix.
  if (len > UINT32_MAX / sizeof(OLECHAR)) return nullptr;
  const UINT textBytes = len * static_cast<UINT>(sizeof(OLECHAR));
  void* block = std::malloc(kPrefixBytes + textBytes + sizeof(OLECHAR));
  if (block == nullptr) return nullptr;
  std::memcpy(block, &textBytes, kPrefixBytes);
  BSTR text = reinterpret_cast<BSTR>(static_cast<char*>(block) + kPrefixBytes);
  if (strIn != nullptr) std::memcpy(text, strIn, textBytes);
  text[len] = 0;
  return text;
}

void SysFreeString(BSTR bstrString) {
  if (bstrString != nullptr) std::free(PrefixOf(bstrString));
}

UINT SysStringLen(BSTR bstr) {
  return bstr == nullptr ? 0 : *PrefixOf(bstr) / static_cast<UINT>(sizeof(OLECHAR));
}

UINT SysStringByteLen(BSTR bstr) { return bstr == nullptr ? 0 : *PrefixOf(bstr); }

}  // namespace win32
