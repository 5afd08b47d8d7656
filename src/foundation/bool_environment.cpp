// GetBoolEnvironmentVariable: the one reader of on/off environment switches.

#include <cstdlib>
#include <memory>

#include "vynutil/utility_interface.h"
#include "win32/environment.h"

namespace {

// The first character of the variable's value, or 0 when it is unset, empty or unreadable.
MCHAR FirstCharacter(const MCHAR* name) {
  MCHAR small[6];
  const DWORD needed = win32::GetEnvironmentVariableW(name, small, 6);
  if (needed == 0) return 0;
  if (needed < 6) return small[0];
  // Longer values are read whole, though only their first character counts.
  std::unique_ptr<MCHAR, decltype(&std::free)> buffer(
      static_cast<MCHAR*>(std::calloc(needed, sizeof(MCHAR))), &std::free);
  if (!buffer || win32::GetEnvironmentVariableW(name, buffer.get(), needed) == 0) return 0;
  return buffer.get()[0];
}

}  // namespace

bool UtilityInterface::GetBoolEnvironmentVariable(const MCHAR* name, bool defaultValue) {
  if (!name) return defaultValue;
  static constexpr MCHAR kTrue[] = {u'y', u'Y', u't', u'T', u'1'};
  static constexpr MCHAR kFalse[] = {u'n', u'N', u'f', u'F', u'0'};
  const MCHAR first = FirstCharacter(name);
  if (first == 0) return defaultValue;
  for (int i = 0; i < 5; ++i) {
    if (first == kTrue[i]) return true;
    if (first == kFalse[i]) return false;
  }
  return defaultValue;
}
