#pragma once
// The text a path stores for given text: a braced asset identifier becomes a file name through
// the host's asset library, when it offers the conversion.

#include <string>

#include "vynutil/wintypes.h"

namespace vyn {

// The file name of the host's asset library, searched for as modules are.
inline constexpr const MCHAR* kAssetLibraryName = u"AssetManagement.dll";

std::u16string StoredPathText(const MCHAR* text);

}  // namespace vyn
