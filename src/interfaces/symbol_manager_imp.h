#pragma once
// The process's symbol manager.

#include <map>
#include <string>

#include "vynutil/symbol_manager.h"

namespace vyn {

class SymbolManagerImp : public ISymbolManager {
 public:
  // The prefix, suffix and root-symbol name come from the library's string resources.
  SymbolManagerImp(std::u16string prefix, std::u16string suffix, const std::u16string& rootName);
  ~SymbolManagerImp() override;

  bool IsSymbolRegistered(const std::u16string& name) override;
  void UnregisterSymbol(const std::u16string& name) override;
  ISymbolResolver* GetSymbolResolver(const std::u16string& name) override;
  bool RegisterSymbol(const std::u16string& name, ISymbolResolver* resolver) override;
  TSymbolString& ResolveSymbols(TSymbolString& text) override;
  const std::u16string& GetDefaultRootSymbol() override { return root_symbol_; }
  const std::u16string& GetSymbolPrefix() override { return prefix_; }
  const std::u16string& GetSymbolSuffix() override { return suffix_; }
  int GetChangeCount() override { return change_count_; }
  void IncrementChangeCount() override { ++change_count_; }

  // The one key under which every spelling of a name is kept: the prefix and the bare name.
  std::u16string CanonicalKey(std::u16string name) const;

 private:
  std::map<std::u16string, ISymbolResolver*> symbols_;
  std::map<ISymbolResolver*, int> resolver_uses_;
  std::u16string root_symbol_;
  std::u16string prefix_;
  std::u16string suffix_;
  int change_count_ = 1;
};

}  // namespace vyn
