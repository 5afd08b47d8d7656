// IniRuleSet: rules in registration order, each behind three selectors.

#include <regex>

#include "config/wide_regex.h"

#include "vynutil/env_ini.h"
#include "vynutil/ini_rule_set_mapper.h"
#include "vynutil/ini_rules.h"
#include "win32/profile.h"

namespace Util {

namespace {

using Rule = WindowsInitializationFileRule;

std::unique_ptr<Selector> MakeSelector(const SelectionMethod& method) {
  switch (method.GetMethod()) {
    case SelectionMethod::String: return std::make_unique<StringSelector>(method.Pattern());
    case SelectionMethod::Regex: return std::make_unique<RegexSelector>(method.Pattern());
    default: return std::make_unique<Selector>();
  }
}

std::u16string Text(const MCHAR* text) { return text != nullptr ? std::u16string(text) : std::u16string(); }

// A list read whole with a buffer doubled from 4096 units while the result shows it was cut.
template <typename Read>
std::u16string ReadList(Read read) {
  std::u16string buffer(4096, u'\0');
  for (;;) {
    const DWORD got = read(buffer.data(), static_cast<DWORD>(buffer.size()));
    if (got != buffer.size() - 2 || buffer.size() >= 0x40000000) {
      buffer.resize(got);
      return buffer;
    }
    buffer.assign(buffer.size() * 2, u'\0');
  }
}

// The strings of a double-null list ("a\0b\0\0" without its last terminator).
template <typename Visit>
void ForEachListItem(const std::u16string& list, Visit visit) {
  std::size_t start = 0;
  while (start < list.size()) {
    const std::size_t end = list.find(u'\0', start);
    const std::size_t stop = end == std::u16string::npos ? list.size() : end;
    if (stop > start) visit(list.substr(start, stop - start));
    start = stop + 1;
  }
}

}  // namespace

struct IniRuleSet::Entry {
  std::unique_ptr<Selector> file;
  std::unique_ptr<Selector> section;
  std::unique_ptr<Selector> key;
  std::unique_ptr<Rule> rule;

  bool Applies(const std::u16string& fileKey, const std::u16string& sectionName, const std::u16string& keyName) const {
    return file->Match(fileKey) && section->Match(sectionName) && key->Match(keyName);
  }
};

IniRuleSet::IniRuleSet() = default;
IniRuleSet::~IniRuleSet() = default;

void IniRuleSet::Register(const SelectionMethod& file, const SelectionMethod& section, const SelectionMethod& key,
                          std::unique_ptr<Rule> rule) {
  m_entries.push_back(Entry{MakeSelector(file), MakeSelector(section), MakeSelector(key), std::move(rule)});
}

void IniRuleSet::RegisterDirectory(const std::u16string& tokenizeFrom, const std::u16string& tokenizeTo,
                                   const SelectionMethod& file, const SelectionMethod& section,
                                   const SelectionMethod& key, bool protect) {
  if (protect) {
    Register(file, section, key, std::make_unique<PathWithProtectedEnvVarExpansion>(3));
  } else {
    Register(file, section, key, std::make_unique<PathWithEnvVarExpansion>(1));
  }
  Register(file, section, key, std::make_unique<Tokenize>(tokenizeFrom, tokenizeTo));
}

Rule::Status IniRuleSet::Validate(const std::u16string& file, const std::u16string& section,
                                  const std::u16string& key, const std::u16string& value, Logger& logger) const {
  const std::u16string fileKey = IniRuleSetMapper::KeyForm(file);
  for (const Entry& entry : m_entries) {
    if (!entry.Applies(fileKey, section, key)) continue;
    const Rule::Status status = entry.rule->Validate(file, section, key, value, logger);
    if (status != Rule::Ok) return status;
  }
  return Rule::Ok;
}

Rule::ProcessResult IniRuleSet::ProcessPostRead(const std::u16string& file, const std::u16string& section,
                                                const std::u16string& key, const std::u16string& value) const {
  if (m_entries.empty()) return {Rule::Ok, value};
  const std::u16string fileKey = IniRuleSetMapper::KeyForm(file);
  std::u16string current = value;
  for (const Entry& entry : m_entries) {
    if (!entry.Applies(fileKey, section, key)) continue;
    Rule::ProcessResult result = entry.rule->ProcessPostRead(file, section, key, current);
    if (result.status != Rule::Ok) return result;
    current = std::move(result.value);
  }
  return {Rule::Ok, current};
}

Rule::ProcessResult IniRuleSet::ProcessPreWrite(const std::u16string& file, const std::u16string& section,
                                                const std::u16string& key, const std::u16string& rawValue,
                                                const std::u16string& newValue) const {
  if (m_entries.empty()) return {Rule::Ok, newValue};
  const std::u16string fileKey = IniRuleSetMapper::KeyForm(file);
  std::u16string current = newValue;
  for (const Entry& entry : m_entries) {
    if (!entry.Applies(fileKey, section, key)) continue;
    Rule::ProcessResult result = entry.rule->ProcessPreWrite(file, section, key, rawValue, current);
    if (result.status != Rule::Ok) return result;
    current = std::move(result.value);
  }
  return {Rule::Ok, current};
}

std::u16string IniRuleSet::PostReadPrivateProfileString(const MCHAR* section, const MCHAR* key, const MCHAR* value,
                                                        const MCHAR* file) const {
  const Rule::ProcessResult result = ProcessPostRead(Text(file), Text(section), Text(key), Text(value));
  if (result.status == Rule::Ok) return result.value;
  Logger::Default.Log(Logger::Error, 157, Text(file).c_str(), Text(section).c_str(), Text(key).c_str(),
                      Text(value).c_str());
  return Text(value);
}

std::u16string IniRuleSet::PreWritePrivateProfileString(const MCHAR* section, const MCHAR* key, const MCHAR* value,
                                                        const MCHAR* file) const {
  const std::u16string raw = EnvIni::Instance().GetRawValue(Text(section), Text(key), Text(file), Text(value));
  const Rule::ProcessResult result = ProcessPreWrite(Text(file), Text(section), Text(key), raw, Text(value));
  if (result.status == Rule::Ok) return result.value;
  Logger::Default.Log(Logger::Error, 156, Text(file).c_str(), Text(section).c_str(), Text(key).c_str(), raw.c_str(),
                      Text(value).c_str());
  return raw;
}

bool IniRuleSet::ValidateIniFile(const MCHAR* file, Logger& logger) const {
  static const std::wregex line(LR"(^([^=]*)(=(.*))?$)", std::regex_constants::ECMAScript);
  const std::u16string fileName = Text(file);
  const std::u16string sections = ReadList([&](MCHAR* buffer, DWORD size) {
    return win32::GetPrivateProfileSectionNamesW(buffer, size, file);
  });
  bool allOk = true;
  ForEachListItem(sections, [&](const std::u16string& section) {
    const std::u16string lines = ReadList([&](MCHAR* buffer, DWORD size) {
      return win32::GetPrivateProfileSectionW(section.c_str(), buffer, size, file);
    });
    ForEachListItem(lines, [&](const std::u16string& text) {
      std::wsmatch parts;
      const std::wstring wide = vyn::config::ToRegexText(text);
      if (!std::regex_match(wide, parts, line)) return;
      const std::u16string key = vyn::config::FromRegexText(parts[1].str());
      const std::u16string value = vyn::config::FromRegexText(parts[3].str());
      if (Validate(fileName, section, key, value, logger) != Rule::Ok) allOk = false;
    });
  });
  return allOk;
}

bool IniRuleSet::ValidateIniFile(const MCHAR* file, Logger&& logger) const { return ValidateIniFile(file, logger); }

}  // namespace Util
