#pragma once
// The library's own failure lines (a mutex that cannot be created, a wait that failed): written
// where a developer watching the process sees them, the standard error stream, in UTF-8.

#include "vynutil/wintypes.h"

namespace vyn {

// Formats with the wide printf conventions (%s takes const MCHAR*) and writes the line as it is;
// the format supplies its own line end.
void WriteDebugLine(const MCHAR* format, ...);

}  // namespace vyn
