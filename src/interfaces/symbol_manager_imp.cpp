#include "interfaces/symbol_manager_imp.h"

#include <utility>
#include <vector>

#include "foundation/library_module.h"
#include "vynutil/resource_string.h"

namespace vyn {

constexpr unsigned kRootSymbolNameResource = 123;
constexpr unsigned kSymbolPrefixResource = 126;
constexpr unsigned kSymbolSuffixResource = 128;

static std::u16string ResourceText(unsigned id) {
  const WStr text = VynSDK::GetResourceStringAsMSTR(LibraryModule(), id);
  return std::u16string(text.data() ? text.data() : u"", static_cast<std::size_t>(text.Length()));
}

static bool EndsWith(const std::u16string& text, const std::u16string& end) {
  return text.size() >= end.size() && text.compare(text.size() - end.size(), end.size(), end) == 0;
}

SymbolManagerImp::SymbolManagerImp(std::u16string prefix, std::u16string suffix,
                                   const std::u16string& rootName)
    : root_symbol_(prefix + rootName + suffix), prefix_(std::move(prefix)), suffix_(std::move(suffix)) {}

SymbolManagerImp::~SymbolManagerImp() {
  std::vector<std::u16string> keys;
  for (const auto& entry : symbols_) keys.push_back(entry.first);
  for (const std::u16string& key : keys) UnregisterSymbol(key);
}

std::u16string SymbolManagerImp::CanonicalKey(std::u16string name) const {
  if (name.empty()) return name;
  if (name.compare(0, prefix_.size(), prefix_) != 0) name.insert(0, prefix_);
  if (!EndsWith(name, suffix_)) name += suffix_;
  // Empty texts would never stop matching.
  while (!prefix_.empty() && EndsWith(name, prefix_)) name.resize(name.size() - prefix_.size());
  while (!suffix_.empty() && EndsWith(name, suffix_)) name.resize(name.size() - suffix_.size());
  return name;
}

bool SymbolManagerImp::IsSymbolRegistered(const std::u16string& name) {
  return symbols_.count(CanonicalKey(name)) != 0;
}

void SymbolManagerImp::UnregisterSymbol(const std::u16string& name) {
  const auto entry = symbols_.find(CanonicalKey(name));
  if (entry == symbols_.end()) return;
  ISymbolResolver* resolver = entry->second;
  const auto uses = resolver_uses_.find(resolver);
  if (uses == resolver_uses_.end() || uses->second < 2) {
    if (uses != resolver_uses_.end()) resolver_uses_.erase(uses);
    delete resolver;
  } else {
    --uses->second;
  }
  symbols_.erase(entry);
}

ISymbolResolver* SymbolManagerImp::GetSymbolResolver(const std::u16string& name) {
  const auto entry = symbols_.find(CanonicalKey(name));
  return entry == symbols_.end() ? nullptr : entry->second;
}

bool SymbolManagerImp::RegisterSymbol(const std::u16string& name, ISymbolResolver* resolver) {
  if (name.empty() || !resolver) return false;
  if (!symbols_.emplace(CanonicalKey(name), resolver).second) return false;
  ++resolver_uses_[resolver];
  return true;
}

TSymbolString& SymbolManagerImp::ResolveSymbols(TSymbolString& text) {
  if (!text.HasSymbols()) return text;
  std::u16string result;
  std::size_t position = 0;
  for (;;) {
    const std::size_t p = text.find(prefix_, position);
    if (p == std::u16string::npos) {
      result.append(text, position);
      break;
    }
    result.append(text, position, p - position);
    const std::size_t s = text.find(suffix_, p + 1);
    if (s == std::u16string::npos) {
      result.append(text, p);
      break;
    }
    // The token runs through the suffix's first character.
    const std::u16string token = text.substr(p, s + 1 - p);
    if (ISymbolResolver* resolver = GetSymbolResolver(token)) {
      result += resolver->ResolveSymbol(token);
    } else {
      result += token;
    }
    position = s + 1;
  }
  if (!result.empty()) static_cast<std::u16string&>(text) = std::move(result);
  return text;
}

}  // namespace vyn

ISymbolManager::~ISymbolManager() = default;

ISymbolManager* ISymbolManager::GetInstance() {
  static vyn::SymbolManagerImp manager(vyn::ResourceText(vyn::kSymbolPrefixResource),
                                       vyn::ResourceText(vyn::kSymbolSuffixResource),
                                       vyn::ResourceText(vyn::kRootSymbolNameResource));
  return &manager;
}
