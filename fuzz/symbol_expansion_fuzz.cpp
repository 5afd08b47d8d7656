// Symbol expansion on arbitrary UTF-16 text: no crash, no hang, and text without any registered
// symbol comes back unchanged.

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>

#include "vynutil/symbol_manager.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const bool registered = [] {
    ISymbolManager* manager = ISymbolManager::GetInstance();
    manager->RegisterSymbol(u"A", new StaticSymbolResolver(u"alpha"));
    manager->RegisterSymbol(u"B", new StaticSymbolResolver(u""));
    return true;
  }();
  (void)registered;
  std::u16string text(size / 2, u'\0');
  if (!text.empty()) std::memcpy(text.data(), data, text.size() * 2);
  TSymbolString symbols(text);
  const bool had = symbols.HasSymbols();
  symbols.Resolve();
  if (!had && symbols != text) __builtin_trap();
  if (text.find(u"$(A)") == std::u16string::npos && text.find(u"$(B)") == std::u16string::npos &&
      symbols != text) {
    __builtin_trap();
  }
  return 0;
}
