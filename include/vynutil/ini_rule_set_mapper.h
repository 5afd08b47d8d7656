#pragma once
// The process-wide choice of INI rules: the application's main INI file and its project files
// (".vxp") get the main rule set, registered plug-in INI files the plug-in rule set, all others
// none. The INI string functions of the library read and write through it.

#include <mutex>
#include <set>
#include <string>

#include "vynutil/export.h"
#include "vynutil/ini_rules.h"

namespace Util {

class VYN_API IniRuleSetMapper {
 public:
  static IniRuleSetMapper& Instance();

  // Stores the main INI file and appends the application's folder rules to both rule sets (each
  // call appends them again). Values written to folder keys get tokenizeFrom (matched in any
  // case) replaced by tokenizeTo.
  void RegisterTavloIniRules(const std::u16string& mainIniFile, const std::u16string& tokenizeFrom,
                             const std::u16string& tokenizeTo);
  // Names an INI file of a plug-in (kept once).
  void AddPluginIniPath(const std::u16string& iniFile);

  IniRuleSet& GetTavloIniRuleSet();
  IniRuleSet& GetPluginIniRuleSet();
  // The rule set of an INI file, or null when no rules apply to it.
  IniRuleSet* GetRuleSet(const std::u16string& iniFile);

  // The platform's GetPrivateProfileStringW with the file's read rules applied to a single value
  // (lists of names pass unchanged). A rejected value is logged (message 157) and gives 0.
  unsigned long GetPrivateProfileStringW(const MCHAR* section, const MCHAR* key, const MCHAR* defaultValue,
                                         MCHAR* buffer, unsigned long size, const MCHAR* file);
  // The platform's WritePrivateProfileStringW with the file's write rules applied; a rejected
  // value keeps the file's text (logged, message 156). Deleting (null key or value) passes.
  int WritePrivateProfileStringW(const MCHAR* section, const MCHAR* key, const MCHAR* value, const MCHAR* file);

  // The same, reading the text from readFile (a copy of file in another encoding) while the
  // rules are chosen, and values remembered, by file.
  unsigned long GetPrivateProfileStringFrom(const MCHAR* section, const MCHAR* key, const MCHAR* defaultValue,
                                            MCHAR* buffer, unsigned long size, const MCHAR* file,
                                            const MCHAR* readFile);

  // The form INI file names are compared in: a Path without trailing separator, normalized, in
  // lower case.
  static std::u16string KeyForm(const std::u16string& iniFile);

 private:
  IniRuleSetMapper() = default;
  std::mutex m_lock;  // guards the names below
  std::set<std::u16string> m_pluginFiles;
  std::u16string m_mainFile;
};

// Whether the host expands environment references in its settings (off until enabled).
class VYN_API EnvironmentExpansionSettings {
 public:
  static EnvironmentExpansionSettings& Instance();
  void EnableExpansion(bool enable);
  bool IsExpansionEnabled() const;
  // True when value holds no %NAME% reference; otherwise logs message 155 (name, value) and is
  // false.
  static bool ValidatePathValue(const std::u16string& value, const std::u16string& name);

 private:
  EnvironmentExpansionSettings() = default;
  bool m_enabled = false;
};

}  // namespace Util
