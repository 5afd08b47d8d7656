#pragma once
// Named symbols inside text, above all inside file paths, and their values. A symbol is written
// as the symbol prefix, a name and the symbol suffix (GetSymbolPrefix / GetSymbolSuffix); each
// registered symbol has a resolver that gives its value on demand. The one manager is reached
// through ISymbolManager::GetInstance(). It is not synchronised: register, remove and resolve on
// one thread at a time.

#include <string>

#include "vynutil/export.h"
#include "vynutil/noncopyable.h"
#include "vynutil/wintypes.h"

class WStr;

// Gives the value of a symbol.
class VYN_API ISymbolResolver {
 public:
  virtual ~ISymbolResolver();
  // The value of symbol (as written in the text, prefix and suffix included).
  virtual std::u16string ResolveSymbol(const std::u16string& symbol) const = 0;
  // Whether the value never changes.
  virtual bool IsStaticValue() const = 0;
};

// A resolver with one fixed value, whatever symbol it is asked for.
class VYN_API StaticSymbolResolver : public ISymbolResolver {
 public:
  StaticSymbolResolver(const StaticSymbolResolver& other);
  explicit StaticSymbolResolver(const std::u16string& value);
  // A null value is taken as empty.
  explicit StaticSymbolResolver(const MCHAR* value);
  ~StaticSymbolResolver() override;
  std::u16string ResolveSymbol(const std::u16string& symbol) const override;
  bool IsStaticValue() const override;

 protected:
  StaticSymbolResolver();

 private:
  std::u16string value_;
};

// Text that may hold symbols.
class VYN_API TSymbolString : public std::u16string {
 public:
  TSymbolString();
  TSymbolString(const TSymbolString& other);
  TSymbolString(const std::u16string& text);
  TSymbolString(const WStr& text);
  // A null text is taken as empty.
  TSymbolString(const MCHAR* text);
  virtual ~TSymbolString();
  TSymbolString& operator=(const TSymbolString& other);

  // True when the first symbol prefix comes before the last symbol suffix.
  bool HasSymbols() const;
  // Replaces every registered symbol by its value (ISymbolManager::ResolveSymbols).
  TSymbolString& Resolve();
};

class VYN_API ISymbolManager : public VynSDK::Util::Noncopyable {
 public:
  // The process's one manager, made at the first call (safe from several threads at once) and
  // destroyed at exit.
  static ISymbolManager* GetInstance();

  // Names may be given bare, with the prefix, or with prefix and suffix: all name one symbol.
  virtual bool IsSymbolRegistered(const std::u16string& name) = 0;
  // Removes a symbol; its resolver is deleted with the last symbol that uses it.
  virtual void UnregisterSymbol(const std::u16string& name) = 0;
  // The symbol's resolver, or null.
  virtual ISymbolResolver* GetSymbolResolver(const std::u16string& name) = 0;
  // Registers name with resolver, which the manager then owns (one resolver may serve several
  // names). False for an empty name, a null resolver or a name already registered; the resolver
  // then stays the caller's.
  virtual bool RegisterSymbol(const std::u16string& name, ISymbolResolver* resolver) = 0;
  // Replaces the registered symbols of text by their values, in place; unregistered symbols stay
  // as written and values are not scanned again. Returns text.
  virtual TSymbolString& ResolveSymbols(TSymbolString& text) = 0;
  // The symbol of the project folder, against which relative paths are made absolute.
  virtual const std::u16string& GetDefaultRootSymbol() = 0;
  virtual const std::u16string& GetSymbolPrefix() = 0;
  virtual const std::u16string& GetSymbolSuffix() = 0;
  // A count that grows whenever symbol values change (1 at first); cached resolutions older than
  // it are stale.
  virtual int GetChangeCount() = 0;
  virtual void IncrementChangeCount() = 0;
  virtual ~ISymbolManager();
};
