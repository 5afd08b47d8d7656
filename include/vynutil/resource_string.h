#pragma once
// String resources of a module as WStr.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"
#include "vynutil/wstr.h"

namespace VynSDK {

// Loads string resource id of module into out; true when it exists and is not empty. A null
// module: false, out untouched. A missing or empty string: out becomes empty, false.
VYN_API bool GetResourceStringAsMSTR(HINSTANCE module, unsigned int id, WStr& out);
// The text of string resource id of module; empty when missing or when module is null.
VYN_API WStr GetResourceStringAsMSTR(HINSTANCE module, unsigned int id);

}  // namespace VynSDK
