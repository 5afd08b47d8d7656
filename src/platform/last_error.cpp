// The per-thread last-error code.

#include "win32/last_error.h"

namespace win32 {

namespace {
thread_local DWORD t_lastError = ERROR_SUCCESS;
}

DWORD GetLastError() noexcept { return t_lastError; }

void SetLastError(DWORD code) noexcept { t_lastError = code; }

}  // namespace win32
