// INI rule sets through the library's INI string functions, on real files: expansion on read,
// protection and tokens on write, rule-set choice by file name, whole-file validation.

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "support/temp_dir.h"
#include "support/test_host.h"
#include "vynutil/env_ini.h"
#include "vynutil/ini_profile.h"
#include "vynutil/ini_rule_set_mapper.h"
#include "win32/environment.h"

namespace {

using Util::IniRuleSetMapper;

std::u16string Read(const MCHAR* section, const MCHAR* key, const std::u16string& file) {
  MCHAR buffer[512];
  VynSDK::Util::GetPrivateProfileStringW(section, key, u"", buffer, 512, file.c_str());
  return buffer;
}

// The raw text of a key, without rules (a file no rule set knows reads it plainly).
std::u16string RawText(const MCHAR* section, const MCHAR* key, const std::u16string& file) {
  const std::u16string plain = file + u".plain";
  std::filesystem::copy_file(std::filesystem::path(std::string(file.begin(), file.end())),
                             std::filesystem::path(std::string(plain.begin(), plain.end())),
                             std::filesystem::copy_options::overwrite_existing);
  return Read(section, key, plain);
}

TEST(IniRules, MainFileFoldersExpandProtectAndTokenize) {
  vyn::test::TempDir dir;
  std::filesystem::create_directories(dir.path() / "install" / "scripts");
  const std::u16string install = dir.File("install");
  win32::SetEnvironmentVariableW(u"VYN_RULES_ROOT", install.c_str());
  const std::u16string main = dir.File("App.ini");
  IniRuleSetMapper& mapper = IniRuleSetMapper::Instance();
  mapper.RegisterTavloIniRules(main, u"D:\\Install\\Dir", u"%ROOT%");
  EXPECT_EQ(mapper.GetRuleSet(main + u"\\"), &mapper.GetTavloIniRuleSet()) << "key forms compare equal";
  EXPECT_EQ(mapper.GetRuleSet(dir.File("scene.VXP")), &mapper.GetTavloIniRuleSet());
  EXPECT_EQ(mapper.GetRuleSet(dir.File("other.ini")), nullptr);

  vyn::test::TestHost host;
  ASSERT_TRUE(VynSDK::Util::WritePrivateProfileStringW(u"Directories", u"Scripts", u"%VYN_RULES_ROOT%\\scripts",
                                                        main.c_str()));
  ASSERT_TRUE(VynSDK::Util::WritePrivateProfileStringW(u"Directories", u"DummyDir", u"%VYN_RULES_ROOT%",
                                                        main.c_str()));
  const std::u16string expanded = install + u"\\scripts";
  EXPECT_EQ(Read(u"Directories", u"Scripts", main), expanded);
  EXPECT_EQ(Read(u"Directories", u"dummydir", main), u"%VYN_RULES_ROOT%") << "keys beginning with Dummy excluded";

  // The same folder written back, in another case and with a trailing separator: unexpanded.
  std::u16string shouted = expanded + u"\\";
  for (char16_t& c : shouted) c = static_cast<char16_t>(c >= u'a' && c <= u'z' ? c - 32 : c);
  ASSERT_TRUE(VynSDK::Util::WritePrivateProfileStringW(u"Directories", u"Scripts", shouted.c_str(), main.c_str()));
  EXPECT_EQ(RawText(u"Directories", u"Scripts", main), u"%VYN_RULES_ROOT%\\scripts");
  EXPECT_TRUE(host.log.empty());
  // Another folder is rejected: the file keeps its text and message 156 is logged.
  ASSERT_TRUE(VynSDK::Util::WritePrivateProfileStringW(u"Directories", u"Scripts", u"/elsewhere", main.c_str()));
  EXPECT_EQ(RawText(u"Directories", u"Scripts", main), u"%VYN_RULES_ROOT%\\scripts");
  ASSERT_EQ(host.log.size(), 1u);
  EXPECT_EQ(host.log[0].type, SYSLOG_ERROR);
  EXPECT_NE(host.log[0].text.find(u"/elsewhere"), std::u16string::npos);

  // A plain (unprotected) folder key gets "\" for "/" and the installation folder as a token.
  ASSERT_TRUE(VynSDK::Util::WritePrivateProfileStringW(u"RenderPresetsMruFiles", u"RenderPresetsMruFile1",
                                                        u"D:/Install/Dir/x", main.c_str()));
  EXPECT_EQ(RawText(u"RenderPresetsMruFiles", u"RenderPresetsMruFile1", main), u"%ROOT%\\x");

  // Validation of the whole file: the rejected-looking values are reported, not changed.
  class Collect : public Util::Logger {
   public:
    void Log(Level, const std::u16string& message) override { messages.push_back(message); }
    using Util::Logger::Log;
    std::vector<std::u16string> messages;
  } collect;
  ASSERT_TRUE(VynSDK::Util::WritePrivateProfileStringW(u"Directories", u"Maps", u"%VYN_UNSET_RULES%\\m",
                                                        main.c_str()));
  EXPECT_FALSE(mapper.GetTavloIniRuleSet().ValidateIniFile(main.c_str(), collect));
  EXPECT_FALSE(collect.messages.empty());
  win32::SetEnvironmentVariableW(u"VYN_RULES_ROOT", nullptr);
}

TEST(IniRules, TokenizeMatchesLiterallyAndIgnoresAnEmptyText) {
  const Util::Tokenize dots(u"C:\\a.b", u"$&!");
  EXPECT_EQ(dots.ProcessPreWrite(u"", u"", u"", u"", u"c:/A.B/c:\\axb").value, u"c:\\A.B!\\c:\\axb");
  const Util::Tokenize empty(u"", u"%ROOT%");
  EXPECT_EQ(empty.ProcessPreWrite(u"", u"", u"", u"", u"a/b").value, u"a\\b") << "no token between characters";
}

TEST(IniRules, PluginFilesAndPathChecks) {
  vyn::test::TempDir dir;
  const std::u16string plugin = dir.File("Plugin.ini");
  IniRuleSetMapper& mapper = IniRuleSetMapper::Instance();
  EXPECT_EQ(mapper.GetRuleSet(plugin), nullptr);
  mapper.AddPluginIniPath(plugin);
  EXPECT_EQ(mapper.GetRuleSet(plugin), &mapper.GetPluginIniRuleSet());

  const Util::PathWithEnvVarExpansion both(3);
  Util::Logger quiet;
  EXPECT_EQ(both.Validate(u"f", u"s", u"k", u".\\relative", quiet), Util::WindowsInitializationFileRule::Ok)
      << "a path starting with . is never missing";
  EXPECT_EQ(both.Validate(u"f", u"s", u"k", u"", quiet), Util::WindowsInitializationFileRule::Rejected);
  EXPECT_EQ(both.Validate(u"f", u"s", u"k", u"%VYN_UNSET_Z%", quiet), Util::WindowsInitializationFileRule::Rejected);
  // Reading keeps an unresolved reference in the value.
  EXPECT_EQ(both.ProcessPostRead(u"f", u"s", u"k", u"%VYN_UNSET_Z%\\a").value, u"%VYN_UNSET_Z%\\a");
  EXPECT_FALSE(Util::EnvironmentExpansionSettings::ValidatePathValue(u"%A%", u"name"));
  EXPECT_TRUE(Util::EnvironmentExpansionSettings::ValidatePathValue(u"C:\\a", u"name"));
}

}  // namespace
