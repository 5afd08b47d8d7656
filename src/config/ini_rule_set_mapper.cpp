// IniRuleSetMapper: which rules apply to an INI file, and the INI string calls through them.

#include "vynutil/ini_rule_set_mapper.h"

#include <algorithm>
#include <string_view>

#include "vynutil/env_ini.h"
#include "vynutil/path.h"
#include "win32/profile.h"

namespace Util {

namespace {

using Rule = WindowsInitializationFileRule;

// A project file of the application: main rules whatever its folder. The same answer as a
// whole-text, case-insensitive match of ".*\.vxp$" (whose "." matches no line terminator),
// without running a regular expression on every INI call.
bool IsProjectFile(const std::u16string& fileKey) {
  constexpr std::u16string_view kSuffix = u".vxp";
  if (fileKey.size() < kSuffix.size()) return false;
  for (const char16_t unit : fileKey) {
    if (unit == u'\n' || unit == u'\r' || unit == 0x2028 || unit == 0x2029) return false;
  }
  const std::size_t start = fileKey.size() - kSuffix.size();
  for (std::size_t i = 0; i < kSuffix.size(); ++i) {
    char16_t unit = fileKey[start + i];
    if (unit >= u'A' && unit <= u'Z') unit = static_cast<char16_t>(unit + 32);
    if (unit != kSuffix[i]) return false;
  }
  return true;
}

// The current text of a key, read with a buffer doubled from 260 units while it may be cut.
std::u16string ReadRawValue(const MCHAR* section, const MCHAR* key, const MCHAR* file) {
  std::u16string buffer(260, u'\0');
  for (;;) {
    const DWORD got = win32::GetPrivateProfileStringW(section, key, u"", buffer.data(),
                                                      static_cast<DWORD>(buffer.size()), file);
    if (got < buffer.size() - 1 || buffer.size() >= 0x40000000) {
      buffer.resize(got);
      return buffer;
    }
    buffer.assign(buffer.size() * 2, u'\0');
  }
}

}  // namespace

IniRuleSetMapper& IniRuleSetMapper::Instance() {
  static IniRuleSetMapper* instance = new IniRuleSetMapper;  // lives until the library goes
  return *instance;
}

std::u16string IniRuleSetMapper::KeyForm(const std::u16string& iniFile) {
  VynSDK::Util::Path path(iniFile.c_str());
  path.RemoveTrailingBackslash();
  path.Normalize();
  path.ConvertToLowerCase();
  return std::u16string(path.GetCStr());
}

IniRuleSet& IniRuleSetMapper::GetTavloIniRuleSet() {
  static IniRuleSet* rules = new IniRuleSet;
  return *rules;
}

IniRuleSet& IniRuleSetMapper::GetPluginIniRuleSet() {
  static IniRuleSet* rules = new IniRuleSet;
  return *rules;
}

void IniRuleSetMapper::RegisterTavloIniRules(const std::u16string& mainIniFile, const std::u16string& tokenizeFrom,
                                             const std::u16string& tokenizeTo) {
  const std::u16string mainKey = KeyForm(mainIniFile);
  {
    std::lock_guard<std::mutex> hold(m_lock);
    m_mainFile = mainKey;
  }
  using M = SelectionMethod;
  const M main(M::String, mainKey.c_str());
  const M any;
  const M project(M::Regex, uR"(.*\.vxp$)");
  auto regex = [](const MCHAR* pattern) { return M(M::Regex, pattern); };
  IniRuleSet& rules = GetTavloIniRuleSet();
  auto add = [&](IniRuleSet& set, const M& file, const MCHAR* section, const MCHAR* key, bool protect) {
    set.RegisterDirectory(tokenizeFrom, tokenizeTo, file, regex(section), regex(key), protect);
  };
  add(rules, main, u"Directories", u"^(?!Dummy).*$", true);
  add(rules, main, u"CuiConfiguration", u"CurrentHotkeyDir", true);
  add(rules, main, u"P(re|ost)RenderScriptDirs", u"Dir.*", true);
  add(rules, main, u"ScriptAssetDirs", u"Dir.*", true);
  add(rules, main, u"RenderPresetsMruFiles", u"RenderPresetsMruFile[0-9]+", false);
  add(rules, main, u"Performance", u"ArchiveProg", true);
  add(rules, main, u"CustomMenus", u"FileName", true);
  add(rules, project, u"BitmapDirs", u"Dir[0-9]+", true);
  add(rules, project, u"Directories", u"^.*", true);
  IniRuleSet& plugins = GetPluginIniRuleSet();
  add(plugins, any, u"Directories", u".*", true);
  add(plugins, any, u"Include", u".*", true);
}

void IniRuleSetMapper::AddPluginIniPath(const std::u16string& iniFile) {
  const std::u16string key = KeyForm(iniFile);
  std::lock_guard<std::mutex> hold(m_lock);
  m_pluginFiles.insert(key);
}

IniRuleSet* IniRuleSetMapper::GetRuleSet(const std::u16string& iniFile) {
  const std::u16string key = KeyForm(iniFile);
  bool main = false;
  bool plugin = false;
  {
    std::lock_guard<std::mutex> hold(m_lock);
    main = key == m_mainFile;
    plugin = m_pluginFiles.count(key) != 0;
  }
  if (main || IsProjectFile(key)) return &GetTavloIniRuleSet();
  if (plugin) return &GetPluginIniRuleSet();
  return nullptr;
}

unsigned long IniRuleSetMapper::GetPrivateProfileStringW(const MCHAR* section, const MCHAR* key,
                                                         const MCHAR* defaultValue, MCHAR* buffer,
                                                         unsigned long size, const MCHAR* file) {
  return GetPrivateProfileStringFrom(section, key, defaultValue, buffer, size, file, file);
}

unsigned long IniRuleSetMapper::GetPrivateProfileStringFrom(const MCHAR* section, const MCHAR* key,
                                                            const MCHAR* defaultValue, MCHAR* buffer,
                                                            unsigned long size, const MCHAR* file,
                                                            const MCHAR* readFile) {
  // Sizes beyond 32 bits are more than any value needs.
  if (size > 0xFFFFFFFFul) size = 0xFFFFFFFFul;
  const DWORD result =
      win32::GetPrivateProfileStringW(section, key, defaultValue, buffer, static_cast<DWORD>(size), readFile);
  if (section == nullptr || key == nullptr || file == nullptr || buffer == nullptr || size == 0) return result;
  IniRuleSet* rules = GetRuleSet(file);
  if (rules == nullptr || result >= size) return result;
  const std::u16string text(buffer, result);
  const Rule::ProcessResult processed = rules->ProcessPostRead(file, section, key, text);
  if (processed.status != Rule::Ok) {
    Logger::Default.Log(Logger::Error, 157, file, section, key, text.c_str());
    return 0;
  }
  const std::size_t copied = std::min<std::size_t>(processed.value.size(), size - 1);
  std::copy_n(processed.value.data(), copied, buffer);
  buffer[copied] = u'\0';
  return static_cast<unsigned long>(copied);
}

int IniRuleSetMapper::WritePrivateProfileStringW(const MCHAR* section, const MCHAR* key, const MCHAR* value,
                                                 const MCHAR* file) {
  IniRuleSet* rules = file != nullptr ? GetRuleSet(file) : nullptr;
  if (rules == nullptr || section == nullptr || key == nullptr || value == nullptr) {
    return win32::WritePrivateProfileStringW(section, key, value, file);
  }
  std::u16string raw = EnvIni::Instance().GetRawValue(section, key, file, u"");
  if (raw.empty()) raw = ReadRawValue(section, key, file);
  const Rule::ProcessResult processed = rules->ProcessPreWrite(file, section, key, raw, value);
  if (processed.status == Rule::Ok) {
    return win32::WritePrivateProfileStringW(section, key, processed.value.c_str(), file);
  }
  const int result = win32::WritePrivateProfileStringW(section, key, raw.empty() ? value : raw.c_str(), file);
  Logger::Default.Log(Logger::Error, 156, file, section, key, raw.c_str(), value);
  return result;
}

}  // namespace Util
