// Symbol resolvers and symbol strings.

#include "vynutil/symbol_manager.h"
#include "vynutil/wstr.h"

ISymbolResolver::~ISymbolResolver() = default;

StaticSymbolResolver::StaticSymbolResolver() = default;
StaticSymbolResolver::StaticSymbolResolver(const StaticSymbolResolver& other) = default;
StaticSymbolResolver::StaticSymbolResolver(const std::u16string& value) : value_(value) {}
StaticSymbolResolver::StaticSymbolResolver(const MCHAR* value) : value_(value ? value : u"") {}
StaticSymbolResolver::~StaticSymbolResolver() = default;

std::u16string StaticSymbolResolver::ResolveSymbol(const std::u16string&) const { return value_; }

bool StaticSymbolResolver::IsStaticValue() const { return true; }

TSymbolString::TSymbolString() = default;
TSymbolString::TSymbolString(const TSymbolString& other) = default;
TSymbolString::TSymbolString(const std::u16string& text) : std::u16string(text) {}
TSymbolString::TSymbolString(const WStr& text)
    : std::u16string(text.data() ? text.data() : u"", static_cast<std::size_t>(text.Length())) {}
TSymbolString::TSymbolString(const MCHAR* text) : std::u16string(text ? text : u"") {}
TSymbolString::~TSymbolString() = default;
TSymbolString& TSymbolString::operator=(const TSymbolString& other) = default;

bool TSymbolString::HasSymbols() const {
  ISymbolManager* manager = ISymbolManager::GetInstance();
  const std::u16string& prefix = manager->GetSymbolPrefix();
  const std::u16string& suffix = manager->GetSymbolSuffix();
  const size_type p = prefix.empty() ? 0 : find(prefix);
  if (p == npos) return false;
  const size_type s = suffix.empty() ? size() : rfind(suffix);
  if (s == npos) return false;
  return p < s;
}

TSymbolString& TSymbolString::Resolve() { return ISymbolManager::GetInstance()->ResolveSymbols(*this); }
