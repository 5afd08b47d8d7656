// Path: the canonical form, the Windows forms, editing, symbols, absolute and relative forms,
// the resolved-path cache and the host calls.

#include <gtest/gtest.h>

#include <QString>

#include <unistd.h>

#include <random>
#include <string>
#include <vector>

#include "support/child_process.h"
#include "support/temp_dir.h"
#include "support/test_host.h"
#include "vynutil/path.h"
#include "vynutil/symbol_manager.h"
#include "win32/network_drives.h"

using VynSDK::Util::Path;

namespace {

std::u16string Text(const Path& p) { return p.GetCStr(); }

// Registers a symbol for the length of a test.
class ScopedSymbol {
 public:
  ScopedSymbol(const MCHAR* name, const MCHAR* value) : name_(name) {
    ISymbolManager::GetInstance()->RegisterSymbol(name_, new StaticSymbolResolver(value));
    ISymbolManager::GetInstance()->IncrementChangeCount();
  }
  ~ScopedSymbol() {
    ISymbolManager::GetInstance()->UnregisterSymbol(name_);
    ISymbolManager::GetInstance()->IncrementChangeCount();
  }

 private:
  std::u16string name_;
};

// The project folder, against which relative paths become absolute.
const MCHAR* const kProjectFolder = u"$(ProjectFolder)";

struct Case {
  const MCHAR* input;
  const MCHAR* expected;
};

template <class Operation>
void ExpectEach(const std::vector<Case>& cases, Operation operation) {
  for (const Case& c : cases) {
    Path p(c.input);
    operation(p);
    EXPECT_EQ(Text(p), std::u16string(c.expected)) << "input: " << QString::fromStdU16String(c.input).toStdString();
  }
}

}  // namespace

TEST(Path, StoredTextUsesBackslashesAndKeepsTheUncPrefix) {
  ExpectEach({{u"C:/a//b/", u"C:\\a\\b\\"},
              {u"\\\\srv\\\\share", u"\\\\srv\\share"},
              {u"//srv/share/x", u"\\\\srv\\share\\x"},
              {u"a\\\\\\b", u"a\\\\b"},  // a run starting before index 2 is kept
              {u"", u""}},
             [](Path&) {});
  EXPECT_TRUE(Path(static_cast<const MCHAR*>(nullptr)).IsEmpty());
  EXPECT_EQ(Text(Path(WStr(u"C:/x"))), u"C:\\x");
}

TEST(Path, NormalizeFoldsDotsButNeverSymbolsOrRoots) {
  ExpectEach({{u"C:", u"C:\\"},
              {u"C:a\\.\\b\\..\\c", u"C:\\a\\c"},
              {u"", u"."},
              {u"a\\b", u".\\a\\b"},
              {u".\\a", u".\\a"},
              {u"..\\a", u"..\\a"},
              {u"$(Sym)\\a", u"$(Sym)\\a"},
              {u"C:\\a\\b\\..\\..\\c", u"C:\\c"},
              {u"a\\..\\b\\..\\c", u".\\c"},
              {u"C:\\..\\a", u"C:\\a"},
              {u"\\..\\a", u"\\a"},
              {u"C:\\a\\.", u"C:\\a"},
              {u"C:\\a\\$(Sym)\\..\\b", u"C:\\a\\$(Sym)\\..\\b"},
              {u"\\\\srv\\share\\a\\..\\b", u"\\\\srv\\share\\b"},
              {u"\\\\srv\\share\\..\\..\\a", u"\\\\srv\\a"},  // never merges names
              {u"a\\..x\\b", u".\\a\\..x\\b"},
              {u"C:\\a\\b\\..", u"C:\\a\\"},  // the separator before the folded part stays
              {u"C:..\\x", u"C:\\x"},
              {u"C:./b", u"C:\\b"}},
             [](Path& p) { p.Normalize(); });
}

TEST(Path, NormalizeIsStableOnRandomPaths) {
  // Normalizing the normalized text again changes nothing, and no "." component survives
  // inside a path.
  const std::vector<std::u16string> parts = {u"a", u"bb", u".", u"..", u"$(S)", u"", u"c.d", u"..."};
  const std::vector<std::u16string> starts = {u"", u"C:", u"C:\\", u"\\", u"\\\\srv\\share\\", u"..\\"};
  std::mt19937 random(7);
  for (int i = 0; i < 3000; ++i) {
    std::u16string text = starts[random() % starts.size()];
    const int count = static_cast<int>(random() % 7);
    for (int j = 0; j < count; ++j) text += parts[random() % parts.size()] + (random() % 4 ? u"\\" : u"/");
    Path once(text.c_str());
    once.Normalize();
    Path twice(once.GetCStr());
    twice.Normalize();
    ASSERT_EQ(Text(twice), Text(once)) << "from " << QString::fromStdU16String(text).toStdString();
    ASSERT_EQ(Text(once).find(u"\\.\\"), std::u16string::npos);
  }
}

TEST(Path, VeryLongPathsAreHandledWhole) {
  std::u16string text = u"C:";
  for (int i = 0; i < 2000; ++i) text += u"\\component" + std::u16string(1, u'a' + i % 26);
  Path p((text + u"\\..\\.\\x").c_str());
  p.Normalize();
  EXPECT_EQ(Text(p), text.substr(0, text.rfind(u'\\')) + u"\\x");
  Path base(u"C:\\");
  Path relative(p);
  relative.ConvertToRelativeTo(base);  // too long for the shell's buffer: left as normalized
  EXPECT_EQ(Text(relative), Text(p));
  EXPECT_TRUE(Path(text.c_str()).IsLegal());
}

TEST(Path, WindowsForms) {
  struct Row {
    const MCHAR* text;
    bool legal, root, absolute, unc, uncShare, backslashRooted, driveRooted, trailing;
  };
  const Row rows[] = {
      {u"", true, false, false, false, false, false, false, false},
      {u"C:", true, false, true, false, false, false, true, false},
      {u"C:\\", true, true, true, false, false, false, true, true},
      {u"C:a", false, false, true, false, false, false, true, false},
      {u":a", false, false, false, false, false, false, false, false},
      {u"C:\\a?b", false, false, true, false, false, false, true, false},
      {u"C:\\a", true, false, true, false, false, false, true, false},
      {u"\\", true, true, true, false, false, true, false, true},
      {u"\\a", true, false, true, false, false, true, false, false},
      {u"\\\\srv\\share", true, true, true, true, true, false, false, false},
      {u"\\\\srv\\share\\a", true, false, true, true, false, false, false, false},
      {u"a\\b\\", true, false, false, false, false, false, false, true},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(QString::fromStdU16String(r.text).toStdString());
    const Path p(r.text);
    EXPECT_EQ(p.IsLegal(), r.legal);
    EXPECT_EQ(p.IsRoot(), r.root);
    EXPECT_EQ(p.IsAbsolute(), r.absolute);
    EXPECT_EQ(p.IsUnc(), r.unc);
    EXPECT_EQ(p.IsUncShare(), r.uncShare);
    EXPECT_EQ(p.IsRootedAtBackslash(), r.backslashRooted);
    EXPECT_EQ(p.IsRootedAtDriveLetter(), r.driveRooted);
    EXPECT_EQ(p.HasTrailingBackslash(), r.trailing);
  }
  EXPECT_TRUE(Path(u"..\\x").StartsWithUpDirectory());
  EXPECT_TRUE(Path(u"a\\..\\..\\x").StartsWithUpDirectory());
  EXPECT_FALSE(Path(u".\\x").StartsWithUpDirectory());
  EXPECT_TRUE(Path(u"C:\\A") == Path(u"C:\\A"));
  EXPECT_FALSE(Path(u"C:\\A").IsEqual(Path(u"c:\\a")));
}

TEST(Path, EditingOperations) {
  ExpectEach({{u"", u"\\"}, {u"a", u"a\\"}, {u"a\\", u"a\\"}}, [](Path& p) { p.AddTrailingBackslash(); });
  ExpectEach({{u"C:\\", u"C:"}, {u"\\", u""}, {u"a", u"a"}}, [](Path& p) { p.RemoveTrailingBackslash(); });
  const auto append = [](const MCHAR* a, const MCHAR* b) { return Text(Path(a).Append(Path(b))); };
  EXPECT_EQ(append(u"C:\\a", u"b"), u"C:\\a\\b");
  EXPECT_EQ(append(u"C:\\a\\", u"\\b"), u"C:\\a\\b");
  EXPECT_EQ(append(u"", u"b"), u"b");
  EXPECT_EQ(append(u"a", u""), u"a");
  const auto prepend = [](const MCHAR* a, const MCHAR* b) { return Text(Path(a).Prepend(Path(b))); };
  EXPECT_EQ(prepend(u"b", u"C:\\a"), u"C:\\a\\b");
  EXPECT_EQ(prepend(u"\\b", u"C:\\a\\"), u"C:\\a\\b");
  Path self(u"x");
  EXPECT_EQ(Text(self.Append(self)), u"x\\x");
  ExpectEach({{u"C:\\a\\b", u"C:\\a"},
              {u"C:\\a", u"C:\\"},
              {u"C:\\", u""},
              {u"\\a", u""},
              {u"\\\\srv\\share", u"\\\\srv"},
              {u"\\\\srv", u""},
              {u"a", u""}},
             [](Path& p) { p.RemoveLeaf(); });
  ExpectEach({{u"C:\\a\\b\\", u"b\\"}, {u"\\\\srv\\share", u"share"}, {u"C:\\", u"C:\\"}, {u"a", u"a"}},
             [](Path& p) { p.StripToLeaf(); });
  ExpectEach({{u"C:\\a\\b", u"C:\\"}, {u"\\\\srv\\share\\a", u"\\\\srv"}, {u"a\\b", u"a"}, {u"\\a\\b", u"\\"},
              {u"a", u"a"}},
             [](Path& p) { p.StripToTopParent(); });
  ExpectEach({{u"C:\\a\\b", u"a\\b"}, {u"\\\\srv\\share\\a", u"share\\a"}, {u"a", u""}},
             [](Path& p) { p.RemoveTopParent(); });
  ExpectEach({{u"C:\\ÄB\\Ω", u"c:\\äb\\ω"}}, [](Path& p) { p.ConvertToLowerCase(); });
}

TEST(Path, AbsoluteAndRelativeFormsRoundTrip) {
  {
    ScopedSymbol project(kProjectFolder, u"C:\\proj");
    ExpectEach({{u"a\\b", u"C:\\proj\\a\\b"}, {u".", u"C:\\proj"}, {u"..\\x", u"C:\\x"}, {u"D:\\y", u"D:\\y"},
                {u"\\top", u"\\top"}},
               [](Path& p) { p.ConvertToAbsolute(); });
    for (const MCHAR* text : {u"C:\\proj\\a\\b.txt", u"C:\\other\\c", u"C:\\proj", u"C:\\"}) {
      Path p(text);
      p.ConvertToRelativeToProjectFolder();
      EXPECT_FALSE(p.IsAbsolute()) << Text(p).size();
      p.ConvertToAbsolute();
      EXPECT_EQ(Text(p), Text(Path(text).Normalize()));
    }
  }
  ExpectEach({{u"a", u"a"}}, [](Path& p) { p.ConvertToAbsolute(); });  // no project folder
  const auto relative = [](const MCHAR* path, const MCHAR* base) {
    return Text(Path(path).ConvertToRelativeTo(Path(base)));
  };
  EXPECT_EQ(relative(u"C:\\a\\b\\c", u"C:\\a"), u".\\b\\c");
  EXPECT_EQ(relative(u"C:\\x", u"C:\\a\\b\\"), u"..\\..\\x");
  EXPECT_EQ(relative(u"\\a\\b", u"C:\\a"), u".\\b");   // the base's drive is taken
  EXPECT_EQ(relative(u"D:\\a", u"C:\\a"), u"D:\\a");   // no common root: normalized only
}

TEST(Path, SymbolsAreResolvedAndTheCacheFollowsTheirChanges) {
  ScopedSymbol project(kProjectFolder, u"C:\\Proj");
  Path p(u"$(Data)\\Models\\..\\scene.max");
  {
    ScopedSymbol data(u"Data", u"D:\\Data");
    const Path& resolved = p.GetResolvedAbsolutePath();
    EXPECT_EQ(Text(resolved), u"d:\\data\\scene.max");
    EXPECT_EQ(&p.GetResolvedAbsolutePath(), &resolved);  // a hit: the same cached path
    EXPECT_EQ(Text(p), u"$(Data)\\Models\\..\\scene.max");
  }
  {
    ScopedSymbol data(u"Data", u"E:\\Other");  // a new value and a new change count
    EXPECT_EQ(Text(p.GetResolvedAbsolutePath()), u"e:\\other\\scene.max");
    Path copy(p);
    EXPECT_EQ(Text(copy.GetResolvedAbsolutePath()), u"e:\\other\\scene.max");
    p.Append(Path(u"x"));
    EXPECT_EQ(Text(p.GetResolvedAbsolutePath()), u"e:\\other\\scene.max\\x");
    Path resolved(u"$(Data)\\a\\.\\b");
    EXPECT_EQ(Text(resolved.ResolveSymbols()), u"E:\\Other\\a\\b");
  }
  // An unknown symbol stays as written.
  EXPECT_EQ(Text(Path(u"$(Data)\\a").GetResolvedAbsolutePath()), u"c:\\proj\\$(data)\\a");
  EXPECT_TRUE(Path(u"C:\\Proj\\").ResolvesEquivalent(Path(u"c:\\proj")));
  EXPECT_TRUE(Path(u"sub").ResolvesEquivalent(Path(u"C:\\PROJ\\Sub\\")));
  EXPECT_FALSE(Path(u"C:\\a").ResolvesEquivalent(Path(u"C:\\b")));
  EXPECT_TRUE(Path(u"C:\\A\\b").IsRootedToFolder(Path(u"c:\\a")));
  EXPECT_FALSE(Path(u"C:\\a").IsRootedToFolder(Path(u"C:\\a\\")));
  EXPECT_FALSE(Path(u"C:\\ab").IsRootedToFolder(Path(u"C:\\a")));
}

TEST(Path, HostCallsFilesAndNetworkDrives) {
  vyn::test::TempDir dir;
  const std::u16string file = dir.Write("a.txt", "x");
  EXPECT_FALSE(Path(file.c_str()).SaveBaseFile());  // no host registered
  {
    vyn::test::TestHost host;
    host.save_base_file_answer = false;
    EXPECT_FALSE(Path(u"C:\\out.txt").SaveBaseFile());
    host.save_base_file_answer = true;
    EXPECT_TRUE(Path(u"C:\\out.txt").SaveBaseFile());
    EXPECT_EQ(host.saved_base_files, (std::vector<std::u16string>{u"C:\\out.txt", u"C:\\out.txt"}));
  }
  Path existing(file.c_str());
  EXPECT_TRUE(existing.Exists());
  EXPECT_TRUE(Path(dir.path().u16string().c_str()).Exists());  // folders count
  EXPECT_FALSE(Path(dir.File("missing").c_str()).Exists());

  ASSERT_TRUE(win32::SetMappedNetworkDrive(u'N', u"\\\\srv\\data"));
  EXPECT_EQ(Text(Path(u"N:\\models\\a.max\\").ConvertToUNC()), u"\\\\srv\\data\\models\\a.max");
  EXPECT_EQ(Text(Path(u"C:\\models").ConvertToUNC()), u"C:\\models");
  win32::SetMappedNetworkDrive(u'N', nullptr);
}

TEST(Path, AssetIdentifiersGoThroughTheHostsAssetLibrary) {
  // The conversion, once found, stays for the life of the process: a fresh process each run.
  if (!vyn::test::InChildProcess()) {
    EXPECT_TRUE(vyn::test::RunCurrentTestInChild({}));
    return;
  }
  const MCHAR* id = u"{6F9619FF-8B86-D011-B42D-00C04FC964FF}";
  EXPECT_EQ(Text(Path(id)), id);  // the library is not found: stored unchanged
  EXPECT_EQ(Text(Path(u"{not-an-identifier-but-38-characters!}")), u"{not-an-identifier-but-38-characters!}");
  char previous[4096];
  ASSERT_NE(getcwd(previous, sizeof previous), nullptr);
  ASSERT_EQ(chdir(VYN_TEST_ASSET_LIBRARY_DIR), 0);  // now the module search finds it
  EXPECT_EQ(Text(Path(id)), u"C:\\assets\\6F9619FF-8B86-D011-B42D-00C04FC964FF");
  ASSERT_EQ(chdir(previous), 0);
  EXPECT_EQ(Text(Path(u"C:/plain")), u"C:\\plain");  // once found, all text goes through it
}
