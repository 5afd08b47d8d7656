#pragma once
// The two entry points the host calls around its use of the library. Both may be called again;
// each acts only on what is not yet (respectively still) loaded, and neither reports failures.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

extern "C" {
// Loads the rich-edit modules "Riched32.dll" and "Riched20.dll" unless an earlier call loaded
// them; a module that cannot be loaded is skipped silently. Returns 1.
VYN_API ULONG_PTR LibInitialize();
// Unloads each rich-edit module that is loaded; a handle is forgotten only when unloading
// succeeded. Returns 1.
VYN_API ULONG_PTR LibShutdown();
}
