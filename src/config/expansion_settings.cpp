// EnvironmentExpansionSettings: the host's expansion switch, and the check for values that must
// hold no %NAME% reference.

#include "vynutil/env_ini.h"
#include "vynutil/ini_rule_set_mapper.h"

namespace Util {

EnvironmentExpansionSettings& EnvironmentExpansionSettings::Instance() {
  static EnvironmentExpansionSettings* instance = new EnvironmentExpansionSettings;
  return *instance;
}

void EnvironmentExpansionSettings::EnableExpansion(bool enable) { m_enabled = enable; }

bool EnvironmentExpansionSettings::IsExpansionEnabled() const { return m_enabled; }

bool EnvironmentExpansionSettings::ValidatePathValue(const std::u16string& value, const std::u16string& name) {
  if (!EnvIni::NeedsExpansion(value)) return true;
  Logger().Log(Logger::Warning, 155, name.c_str(), value.c_str());
  return false;
}

}  // namespace Util
