// The base INI rule and the two folder rules (plain and protected %NAME% expansion).

#include "vynutil/env_ini.h"
#include "vynutil/ini_rules.h"
#include "vynutil/path.h"
#include "win32/file_attributes.h"

namespace Util {

namespace {

using Rule = WindowsInitializationFileRule;

constexpr unsigned short kReportReference = 1;
constexpr unsigned short kReportMissing = 2;

// The check both folder rules make: a reference left after expansion (flag 1, message 153), an
// empty value or one naming no existing path (flag 2, message 154; a value starting with "." is
// relative to something unknown here and passes).
Rule::Status ValidatePath(const std::u16string& file, const std::u16string& section, const std::u16string& key,
                          const std::u16string& value, unsigned short flags, Logger& logger) {
  const std::u16string expanded = EnvIni::ExpandEnvVars(value);
  if ((flags & kReportReference) && EnvIni::NeedsExpansion(expanded)) {
    logger.Log(Logger::Warning, 153, file.c_str(), section.c_str(), key.c_str(), value.c_str(), expanded.c_str());
    return Rule::Rejected;
  }
  if ((flags & kReportMissing) &&
      (expanded.empty() || (expanded[0] != u'.' && !win32::PathFileExistsW(expanded.c_str())))) {
    logger.Log(Logger::Warning, 154, file.c_str(), section.c_str(), key.c_str(), expanded.c_str());
    return Rule::Rejected;
  }
  return Rule::Ok;
}

// The form two folders are compared in: normalized, lower case, with a trailing separator.
VynSDK::Util::Path Comparable(const std::u16string& folder) {
  VynSDK::Util::Path path(folder.c_str());
  path.Normalize();
  path.ConvertToLowerCase();
  path.AddTrailingBackslash();
  return path;
}

}  // namespace

Rule::~WindowsInitializationFileRule() = default;

Rule::Status Rule::Validate(const std::u16string&, const std::u16string&, const std::u16string&,
                            const std::u16string&, Logger&) const {
  return Ok;
}

Rule::ProcessResult Rule::ProcessPostRead(const std::u16string&, const std::u16string&, const std::u16string&,
                                          const std::u16string& value) const {
  return {Ok, value};
}

Rule::ProcessResult Rule::ProcessPreWrite(const std::u16string&, const std::u16string&, const std::u16string&,
                                          const std::u16string&, const std::u16string& newValue) const {
  return {Ok, newValue};
}

PathWithEnvVarExpansion::PathWithEnvVarExpansion(unsigned short validationFlags) : m_flags(validationFlags) {}

Rule::Status PathWithEnvVarExpansion::Validate(const std::u16string& file, const std::u16string& section,
                                               const std::u16string& key, const std::u16string& value,
                                               Logger& logger) const {
  return ValidatePath(file, section, key, value, m_flags, logger);
}

Rule::ProcessResult PathWithEnvVarExpansion::ProcessPostRead(const std::u16string& file, const std::u16string& section,
                                                             const std::u16string& key,
                                                             const std::u16string& value) const {
  if (!EnvIni::NeedsExpansion(value)) return {Ok, value};
  std::u16string expanded = EnvIni::ExpandEnvVars(value);
  ValidatePath(file, section, key, expanded, m_flags, Logger::Default);  // reported, not enforced
  return {Ok, std::move(expanded)};
}

PathWithProtectedEnvVarExpansion::PathWithProtectedEnvVarExpansion(unsigned short validationFlags)
    : m_flags(validationFlags) {}

Rule::Status PathWithProtectedEnvVarExpansion::Validate(const std::u16string& file, const std::u16string& section,
                                                        const std::u16string& key, const std::u16string& value,
                                                        Logger& logger) const {
  return ValidatePath(file, section, key, value, m_flags, logger);
}

Rule::ProcessResult PathWithProtectedEnvVarExpansion::ProcessPostRead(const std::u16string& file,
                                                                      const std::u16string& section,
                                                                      const std::u16string& key,
                                                                      const std::u16string& value) const {
  if (!EnvIni::NeedsExpansion(value)) return {Ok, value};
  EnvIni& memory = EnvIni::Instance();
  std::u16string expanded = memory.HasExpansion(section, key, file) ? memory.GetExpansion(section, key, file)
                                                                    : memory.SetExpansion(section, key, file, value);
  ValidatePath(file, section, key, expanded, m_flags, Logger::Default);
  return {Ok, std::move(expanded)};
}

Rule::ProcessResult PathWithProtectedEnvVarExpansion::ProcessPreWrite(const std::u16string& file,
                                                                      const std::u16string& section,
                                                                      const std::u16string& key,
                                                                      const std::u16string& rawValue,
                                                                      const std::u16string& newValue) const {
  if (!EnvIni::NeedsExpansion(rawValue)) return {Ok, newValue};
  EnvIni& memory = EnvIni::Instance();
  if (!memory.HasExpansion(section, key, file)) memory.SetExpansion(section, key, file, rawValue);
  const bool same = Comparable(memory.GetExpansion(section, key, file)) == Comparable(newValue);
  return {same ? Ok : Rejected, rawValue};
}

}  // namespace Util
