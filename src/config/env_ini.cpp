// Util::EnvIni: environment expansion of INI values and the memory of raw values.

#include "vynutil/env_ini.h"

#include "config/env_reference.h"
#include "win32/environment.h"

namespace Util {

EnvIni& EnvIni::Instance() {
  static EnvIni* instance = new EnvIni;  // used until the library goes; never destroyed
  return *instance;
}

std::u16string EnvIni::ExpandEnvVars(const std::u16string& text) {
  // The size may grow between the two calls when another thread sets a variable: ask again.
  std::u16string out;
  DWORD needed = win32::ExpandEnvironmentStringsW(text.c_str(), nullptr, 0);
  while (needed != 0) {
    out.assign(needed, u'\0');
    const DWORD written = win32::ExpandEnvironmentStringsW(text.c_str(), out.data(), needed);
    if (written == 0) break;
    if (written <= needed) {
      out.resize(written - 1);
      return out;
    }
    needed = written;
  }
  return text;
}

bool EnvIni::NeedsExpansion(const std::u16string& text) {
  return vyn::config::HasEnvironmentReference(text.data(), text.size());
}

bool EnvIni::HasExpansion(const std::u16string& section, const std::u16string& key, const std::u16string& file) {
  std::lock_guard<std::mutex> hold(m_lock);
  return m_values.count(Key(section, key, file)) != 0;
}

std::u16string EnvIni::GetExpansion(const std::u16string& section, const std::u16string& key,
                                    const std::u16string& file) {
  std::lock_guard<std::mutex> hold(m_lock);
  const auto found = m_values.find(Key(section, key, file));
  return found != m_values.end() ? found->second.expansion : std::u16string();
}

std::u16string EnvIni::GetRawValue(const std::u16string& section, const std::u16string& key,
                                   const std::u16string& file, const std::u16string& fallback) {
  std::lock_guard<std::mutex> hold(m_lock);
  const auto found = m_values.find(Key(section, key, file));
  return found != m_values.end() ? found->second.raw : fallback;
}

std::u16string EnvIni::SetExpansion(const std::u16string& section, const std::u16string& key,
                                    const std::u16string& file, const std::u16string& raw) {
  std::u16string expansion = ExpandEnvVars(raw);
  std::lock_guard<std::mutex> hold(m_lock);
  m_values[Key(section, key, file)] = Value{raw, expansion};
  return expansion;
}

}  // namespace Util
