#pragma once
// Process and thread services: yielding, debugger checks and debug breaks, identifiers.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Gives up the rest of the time slice; returns nonzero when another thread ran.
VYN_API BOOL SwitchToThread() noexcept;
VYN_API BOOL IsDebuggerPresent() noexcept;
// Stops in the debugger when one is attached (SIGTRAP); does nothing otherwise.
VYN_API void DebugBreak() noexcept;
VYN_API DWORD GetCurrentProcessId() noexcept;
VYN_API DWORD GetCurrentThreadId() noexcept;

}  // namespace win32
