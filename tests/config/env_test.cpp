// The configuration code's logger, the expansion memory and the folder variables, against the
// real process environment and real folders.

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "support/temp_dir.h"
#include "support/test_host.h"
#include "vynutil/env_ini.h"
#include "vynutil/env_path.h"
#include "vynutil/util_logger.h"
#include "win32/environment.h"

namespace {

using Util::EnvIni;
using Util::EnvPath;
using Util::Logger;

// Collects what it is told instead of sending it to the host.
class CollectingLogger : public Logger {
 public:
  void Log(Level level, const std::u16string& message) override {
    levels.push_back(level);
    messages.push_back(message);
  }
  using Logger::Log;
  std::vector<Level> levels;
  std::vector<std::u16string> messages;
};

// Sets a variable of the process environment for a scope.
class ScopedVariable {
 public:
  ScopedVariable(const MCHAR* name, const std::u16string& value) : m_name(name) {
    win32::SetEnvironmentVariableW(name, value.c_str());
  }
  ~ScopedVariable() { win32::SetEnvironmentVariableW(m_name, nullptr); }

 private:
  const MCHAR* m_name;
};

TEST(UtilLogger, FormatsResourcesAndReachesTheHostLog) {
  Logger::Default.Log(Logger::Error, 157, u"f", u"s", u"k", u"v");  // no host: silently dropped
  vyn::test::TestHost host;
  Logger::Default.Log(Logger::Warning, 152, u"KORV_X", u"C:\\none");
  Logger::Default.Log(Logger::Information, 999999);  // no such resource: an empty entry
  Logger::Default.Log(Logger::Error, std::u16string(u"plain"));
  ASSERT_EQ(host.log.size(), 3u);
  EXPECT_EQ(host.log[0].type, SYSLOG_WARN);
  EXPECT_NE(host.log[0].text.find(u"KORV_X"), std::u16string::npos);
  EXPECT_NE(host.log[0].text.find(u"C:\\none"), std::u16string::npos);
  EXPECT_EQ(host.log[1].type, SYSLOG_INFO);
  EXPECT_EQ(host.log[1].text, u"");
  EXPECT_EQ(host.log[2].type, SYSLOG_ERROR);
  EXPECT_EQ(host.log[2].text, u"plain");
  EXPECT_EQ(host.log[2].title, u"");
  EXPECT_FALSE(host.log[2].dialogue);

  // An argument longer than the room left is cut, not refused.
  CollectingLogger collector;
  const std::u16string huge(5000, u'x');
  collector.Log(Logger::Warning, 155, u"name", huge.c_str());
  ASSERT_EQ(collector.messages.size(), 1u);
  EXPECT_LT(collector.messages[0].size(), 1200u);
  EXPECT_EQ(collector.messages[0].substr(0, 5), u"name:");
  EXPECT_EQ(host.log.size(), 3u) << "an overriding logger keeps messages away from the host";
}

TEST(EnvIni, ExpansionAndMemory) {
  ScopedVariable v(u"VYN_TEST_ROOT", u"/opt/app");
  EXPECT_EQ(EnvIni::ExpandEnvVars(u"%vyn_test_root%\\x %UNSET_VYN% 50%"), u"/opt/app\\x %UNSET_VYN% 50%");
  EXPECT_TRUE(EnvIni::NeedsExpansion(u"a%B_1%c"));
  for (const std::u16string no : {u"", u"%%", u"%1A%", u"% A%", u"100%", u"%A"}) {
    EXPECT_FALSE(EnvIni::NeedsExpansion(no)) << std::string(no.begin(), no.end());
  }
  EnvIni& memory = EnvIni::Instance();
  EXPECT_EQ(memory.GetRawValue(u"S", u"K", u"F-env", u"fallback"), u"fallback");
  EXPECT_EQ(memory.SetExpansion(u"S", u"K", u"F-env", u"%VYN_TEST_ROOT%\\a"), u"/opt/app\\a");
  EXPECT_TRUE(memory.HasExpansion(u"S", u"K", u"F-env"));
  EXPECT_FALSE(memory.HasExpansion(u"s", u"K", u"F-env")) << "names are compared exactly";
  EXPECT_EQ(memory.GetRawValue(u"S", u"K", u"F-env", u"other"), u"%VYN_TEST_ROOT%\\a");
  EXPECT_EQ(memory.GetExpansion(u"S", u"K", u"F-env"), u"/opt/app\\a");
}

TEST(EnvPath, SplittingAndCheckingFolderLists) {
  const auto pieces = EnvPath::SplitPath(u"a;;b;");
  ASSERT_EQ(pieces.size(), 4u);
  EXPECT_TRUE(pieces[1] == u"");
  EXPECT_TRUE(pieces[3] == u"");
  EXPECT_EQ(EnvPath::SplitPath(u"").size(), 1u);

  vyn::test::TempDir dir;
  std::filesystem::create_directory(dir.path() / "one");
  std::filesystem::create_directory(dir.path() / "two");
  const std::u16string one = dir.File("one");
  const std::u16string two = dir.File("two");
  const std::u16string missing = dir.File("missing");
  CollectingLogger logger;
  const std::vector<WStr> candidates{one.c_str(), u"", u"%VYN_UNSET_X%\\y", missing.c_str(), two.c_str()};
  EXPECT_EQ(EnvPath::ValidatePathCandidates(logger, candidates, u"VAR", false).size(), 3u);
  EXPECT_EQ(EnvPath::ValidatePathCandidates(logger, candidates, u"VAR", true).size(), 2u);
  ASSERT_EQ(logger.messages.size(), 6u) << "151, 150, 152 for each run";
  EXPECT_NE(logger.messages[0].find(u"VAR"), std::u16string::npos);

  // A list variable: an empty piece is reported once, the list is cached until the value changes.
  vyn::test::TestHost host;
  {
    ScopedVariable list(u"KORV_TAVLO_PLUGINS_ADDON_DIR", one + u";;" + two);
    EXPECT_EQ(EnvPath::ComputePathList(EnvPath::PluginsAddon).size(), 2u);
    EXPECT_EQ(EnvPath::ComputePathList(EnvPath::PluginsAddon).size(), 2u);
    EXPECT_EQ(host.log.size(), 1u) << "an unchanged value is checked once";
  }
  {
    ScopedVariable list(u"KORV_TAVLO_PLUGINS_ADDON_DIR", two);
    const auto folders = EnvPath::ComputePathList(EnvPath::PluginsAddon);
    ASSERT_EQ(folders.size(), 1u) << "a changed value is noticed";
    std::filesystem::create_directory(dir.path() / "two" / "sub");
    std::ofstream(dir.path() / "two" / "plugin.dlx") << "x";
    WStr found;
    EXPECT_TRUE(EnvPath::LocateFile(EnvPath::PluginsAddon, u"plugin.dlx", found));
    EXPECT_FALSE(EnvPath::LocateFile(EnvPath::PluginsAddon, u"absent.dlx", found));
  }
  EXPECT_TRUE(EnvPath::ComputePathList(EnvPath::PluginsAddon).empty()) << "unset";
  EXPECT_TRUE(EnvPath::ComputePathList(static_cast<EnvPath::MultiPathVariable>(42)).empty());
}

TEST(EnvPath, SingleFolders) {
  vyn::test::TestHost host;
  VynSDK::Util::Path out;
  {
    ScopedVariable tooLong(u"KORV_TAVLO_USERSETTINGS_DIR", u"/" + std::u16string(300, u'a'));
    EXPECT_FALSE(EnvPath::GetSinglePath(EnvPath::UserSettings, out));
  }
  {
    ScopedVariable unresolved(u"KORV_TAVLO_APPDATA_DIR", u"%VYN_UNSET_Y%\\a");
    EXPECT_FALSE(EnvPath::GetSinglePath(EnvPath::AppData, out));
  }
  EXPECT_TRUE(host.log.empty()) << "too long and AppData fail silently";
  {
    ScopedVariable unresolved(u"KORV_TAVLO_USERSETTINGS_DIR", u"%VYN_UNSET_Y%\\a");
    EXPECT_FALSE(EnvPath::GetSinglePath(EnvPath::UserSettings, out));
    EXPECT_EQ(host.log.size(), 1u);
  }
  {
    ScopedVariable tools(u"KORV_TAVLO_USERTOOLS_DIR", u"C:\\Tools\\.\\x\\..\\bin");
    ASSERT_TRUE(EnvPath::GetSinglePathByVynDirectoryID(49, out));
    EXPECT_EQ(std::u16string(out.GetCStr()), u"C:\\Tools\\bin") << "normalized, existence not checked";
    EXPECT_FALSE(EnvPath::GetSinglePathByVynDirectoryID(50, out));
  }
}

}  // namespace
