#pragma once
// How Windows reads a module name: the default extension and case-insensitive matching.

#include <string>
#include <string_view>

#include "vynutil/wintypes.h"

namespace win32::detail {

// The name as the loader looks for it: a last component without extension gets ".dll"; a last
// component ending in '.' means "no extension" and loses that dot.
std::u16string WithDefaultExtension(std::u16string_view name);
// True when the name has a folder part ('\', '/' or a drive), so it is not searched for.
bool HasFolderPart(std::u16string_view name);
// True when two module names or paths are the same without regard to case.
bool SameModuleName(std::u16string_view a, std::u16string_view b);
// The last component of a POSIX path.
std::string_view BaseName(std::string_view path);

}  // namespace win32::detail
