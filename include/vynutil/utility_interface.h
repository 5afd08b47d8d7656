#pragma once
// Product identity and on/off environment switches.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace UtilityInterface {

// The one reader of on/off environment switches. Only the first character of the value counts:
// y, Y, t, T, 1 give true; n, N, f, F, 0 give false; anything else, an empty or unset variable or
// a null name give defaultValue.
VYN_API bool GetBoolEnvironmentVariable(const MCHAR* name, bool defaultValue);

// Product identity texts. Each returned pointer stays valid for the life of the process. An
// empty value (a missing string resource) is built again at the next call.
// The company name (string resource 112 of this library).
VYN_API const MCHAR* GetCompanyName();
// The registry's software root (string resource 109 of this library).
VYN_API const MCHAR* GetRegistrySoftwareBase();
// The product name (string resource 30000 of the host program).
VYN_API const MCHAR* GetProductName();
// "27.1".
VYN_API const MCHAR* GetCurrentVersion();
// "<software base>\<company>".
VYN_API const MCHAR* GetRegistryCompanyBase();
// "<company base>\<product>\27.0", built at the first call only.
VYN_API const MCHAR* GetRegistryKeyBase();

}  // namespace UtilityInterface
