#pragma once
// The resource tables modules registered with VynRegisterModuleResources, by module handle.

#include "vynutil/module_resources.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

// The tables of module, or null when it registered none. They stay valid while the module is
// loaded.
const VynModuleResources* ResourcesOf(HMODULE module);
// True when entry is one of the data resources of a registered table, so that a resource handle
// can be checked before it is read.
bool IsRegisteredDataResource(const VynDataResource* entry);

}  // namespace win32::detail
