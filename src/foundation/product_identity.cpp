// Product identity: texts from string resources and the version, composed for registry paths.

#include "foundation/library_module.h"
#include "vynutil/resource_string.h"
#include "vynutil/utility_interface.h"
#include "win32/module.h"

namespace {

constexpr int kMajorVersion = 27;
constexpr int kMinorVersion = 1;

// Keeps value in a process-wide text that is built again by make while it is empty.
template <class Make>
const MCHAR* KeptUntilNotEmpty(WStr& value, Make make) {
  if (value.Length() == 0) value = make();
  return value.data();
}

}  // namespace

namespace UtilityInterface {

const MCHAR* GetCompanyName() {
  static WStr value;
  return KeptUntilNotEmpty(value, [] { return VynSDK::GetResourceStringAsMSTR(vyn::LibraryModule(), 112); });
}

const MCHAR* GetRegistrySoftwareBase() {
  static WStr value;
  return KeptUntilNotEmpty(value, [] { return VynSDK::GetResourceStringAsMSTR(vyn::LibraryModule(), 109); });
}

const MCHAR* GetProductName() {
  static WStr value;
  return KeptUntilNotEmpty(value, [] {
    return VynSDK::GetResourceStringAsMSTR(win32::GetModuleHandleW(nullptr), 30000);
  });
}

const MCHAR* GetCurrentVersion() {
  static WStr value;
  return KeptUntilNotEmpty(value, [] {
    WStr text;
    text.printf(u"%d.%d", kMajorVersion, kMinorVersion);
    return text;
  });
}

const MCHAR* GetRegistryCompanyBase() {
  static WStr value;
  return KeptUntilNotEmpty(value, [] {
    WStr text;
    text.printf(u"%s\\%s", GetRegistrySoftwareBase(), GetCompanyName());
    return text;
  });
}

const MCHAR* GetRegistryKeyBase() {
  static const WStr value = [] {
    WStr text;
    text.printf(u"%s\\%s\\%d.0", GetRegistryCompanyBase(), GetProductName(), kMajorVersion);
    return text;
  }();
  return value.data();
}

}  // namespace UtilityInterface
