#include <gtest/gtest.h>

#include <string>

#include "vynutil/symbol_manager.h"

namespace {

// A resolver that counts its own destruction.
class CountedResolver : public StaticSymbolResolver {
 public:
  CountedResolver(const MCHAR* value, int* deleted) : StaticSymbolResolver(value), deleted_(deleted) {}
  ~CountedResolver() override { ++*deleted_; }

 private:
  int* deleted_;
};

ISymbolManager& Manager() { return *ISymbolManager::GetInstance(); }

std::u16string Resolved(const MCHAR* text) {
  TSymbolString s(text);
  return Manager().ResolveSymbols(s);
}

}  // namespace

TEST(SymbolManager, TextsComeFromTheLibrarysResources) {
  EXPECT_EQ(Manager().GetSymbolPrefix(), u"$(");
  EXPECT_EQ(Manager().GetSymbolSuffix(), u")");
  EXPECT_EQ(Manager().GetDefaultRootSymbol(), u"$(ProjectFolder)");
  EXPECT_EQ(ISymbolManager::GetInstance(), &Manager());
  const int count = Manager().GetChangeCount();
  EXPECT_GE(count, 1);
  Manager().IncrementChangeCount();
  EXPECT_EQ(Manager().GetChangeCount(), count + 1);
}

TEST(SymbolManager, EverySpellingNamesOneSymbolAndResolversAreOwned) {
  int deleted = 0;
  auto* shared = new CountedResolver(u"shared", &deleted);
  ASSERT_TRUE(Manager().RegisterSymbol(u"One", shared));
  for (const MCHAR* spelling : {u"One", u"$(One", u"$(One)", u"One)", u"$(One))"}) {
    SCOPED_TRACE(std::string(spelling, spelling + std::char_traits<MCHAR>::length(spelling)));
    EXPECT_TRUE(Manager().IsSymbolRegistered(spelling));
    EXPECT_EQ(Manager().GetSymbolResolver(spelling), shared);
  }
  EXPECT_FALSE(Manager().IsSymbolRegistered(u"one"));  // names keep their case
  // A second registration under any spelling is refused; the caller keeps its resolver.
  CountedResolver refused(u"other", &deleted);
  EXPECT_FALSE(Manager().RegisterSymbol(u"$(One)", &refused));
  EXPECT_FALSE(Manager().RegisterSymbol(u"", shared));
  EXPECT_FALSE(Manager().RegisterSymbol(u"Two", nullptr));
  // One resolver under two names lives until the second name goes.
  ASSERT_TRUE(Manager().RegisterSymbol(u"$(Two)", shared));
  Manager().UnregisterSymbol(u"One");
  EXPECT_EQ(deleted, 0);
  EXPECT_FALSE(Manager().IsSymbolRegistered(u"One"));
  Manager().UnregisterSymbol(u"One");  // no longer there: nothing happens
  Manager().UnregisterSymbol(u"Two");
  EXPECT_EQ(deleted, 1);
}

TEST(SymbolManager, ResolvingReplacesRegisteredSymbolsOnly) {
  Manager().RegisterSymbol(u"Dir", new StaticSymbolResolver(u"C:\\data"));
  Manager().RegisterSymbol(u"Empty", new StaticSymbolResolver(u""));
  Manager().RegisterSymbol(u"Loop", new StaticSymbolResolver(u"$(Dir)"));
  struct Row {
    const MCHAR* text;
    const MCHAR* expected;
  } rows[] = {
      {u"$(Dir)\\a.txt", u"C:\\data\\a.txt"},
      {u"x$(Dir)y$(Dir)z", u"xC:\\datayC:\\dataz"},
      {u"$(Unknown)\\a", u"$(Unknown)\\a"},          // unregistered: kept as written
      {u"$(Dir\\a", u"$(Dir\\a"},                    // no suffix after the prefix
      {u"$(Empty)", u"$(Empty)"},                    // an empty result is not assigned
      {u"a$(Empty)b", u"ab"},
      {u"$(Loop)", u"$(Dir)"},                       // values are not scanned again
      {u"$($(Dir)", u"$($(Dir)"},                    // the token is "$($(Dir)", not registered
      {u")$(Dir", u")$(Dir"},                        // suffix before prefix: no symbols
      {u"", u""},
  };
  for (const Row& row : rows) EXPECT_EQ(Resolved(row.text), row.expected);
  EXPECT_FALSE(TSymbolString(u")a$(").HasSymbols());
  EXPECT_TRUE(TSymbolString(u"$()").HasSymbols());
  EXPECT_FALSE(TSymbolString(static_cast<const MCHAR*>(nullptr)).HasSymbols());
  TSymbolString text(u"$(Dir)");
  EXPECT_EQ(&text.Resolve(), &text);
  EXPECT_EQ(text, u"C:\\data");
  for (const MCHAR* name : {u"Dir", u"Empty", u"Loop"}) Manager().UnregisterSymbol(name);
}
