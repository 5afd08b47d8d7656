#pragma once
// Closing kernel-object handles (open files and the other objects CloseHandle takes).

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Closes the handle; the object goes when its last handle is closed (an open file is closed, a
// file opened with FILE_FLAG_DELETE_ON_CLOSE may be deleted). FALSE with ERROR_INVALID_HANDLE for
// null, INVALID_HANDLE_VALUE, a handle already closed, and a handle that CloseHandle does not
// take (a search handle of FindFirstFileW, an enumeration of WNetOpenEnumW).
VYN_API BOOL CloseHandle(HANDLE hObject);

}  // namespace win32
