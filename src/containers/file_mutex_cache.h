#pragma once
// The file mutexes this process has used, kept open: a file's INI or log mutex is taken again and
// again, and opening a named mutex afresh each time costs far more than waiting on it.

#include <string>

#include "vynutil/wintypes.h"

namespace vyn::containers {

// A handle to the named mutex, null when it cannot be created. When kept is true the handle
// belongs to the cache and must not be closed; otherwise the caller closes it.
HANDLE OpenFileMutex(const std::u16string& name, bool& kept);

// Closes a handle from OpenFileMutex unless the cache keeps it.
void CloseFileMutex(HANDLE handle);

}  // namespace vyn::containers
