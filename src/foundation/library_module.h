#pragma once
// The library's own module handle: where its string resources and dialogs are found.

#include "vynutil/wintypes.h"

namespace vyn {

HINSTANCE LibraryModule() noexcept;

}  // namespace vyn
