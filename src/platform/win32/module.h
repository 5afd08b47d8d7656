#pragma once
// Modules as Win32 sees them: shared objects loaded by name or path, found again by name, and
// asked for exported functions. An HMODULE (= HINSTANCE) is the module's loader handle; the
// main program has one too. Loads are counted: FreeLibrary unloads after as many calls as there
// were loads. Handles are checked against the loaded modules before use, so a stale or made-up
// handle gives an error, never a crash.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

// Loads a module and returns its handle, or null with the last error set (ERROR_MOD_NOT_FOUND
// when no file of that name exists, ERROR_DLL_INIT_FAILED when it exists but cannot be loaded,
// ERROR_INVALID_PARAMETER for a null name). A Windows-form path is mapped to the file system
// (see path_map.h); its last component is matched case-insensitively in its folder. A bare file
// name that matches a loaded module (case-insensitively) loads that module again; otherwise it is
// searched as Windows searches it: the program's folder, then the system's library search, then
// the current folder, then the folders of PATH; names are matched case-insensitively inside each
// folder. A name without extension gets ".dll"; a name ending in '.' has no extension.
VYN_API HMODULE LoadLibraryW(const MCHAR* fileName);
// LoadLibraryW with a reserved file handle and flags: with a null hFile and dwFlags 0 it is
// LoadLibraryW; anything else gives null with ERROR_INVALID_PARAMETER (no other loading mode is
// offered).
VYN_API HMODULE LoadLibraryExW(const MCHAR* fileName, HANDLE hFile, DWORD dwFlags);
// Gives up one load; the module is unloaded with its last one. FALSE with ERROR_MOD_NOT_FOUND
// for a null or unknown handle, with ERROR_INVALID_HANDLE when the module has no load left to
// give up.
VYN_API BOOL FreeLibrary(HMODULE module);
// The handle of an already loaded module, without counting a load; null → the main program.
// Names and paths are compared as LoadLibraryW compares them. Null with ERROR_MOD_NOT_FOUND when
// no loaded module has that name.
VYN_API HMODULE GetModuleHandleW(const MCHAR* moduleName);
// An exported function or variable of the module itself (not of the modules it depends on), or
// null with ERROR_PROC_NOT_FOUND; ordinals are not supported. Null module → the main program;
// an unknown module gives ERROR_MOD_NOT_FOUND.
VYN_API FARPROC GetProcAddress(HMODULE module, const char* name);
// The module's full file name (a POSIX path), as GetModuleFileNameW writes it: on success the
// length without terminator; when the buffer is too small the name is cut to size − 1 units,
// terminated, size is returned and the last error is ERROR_INSUFFICIENT_BUFFER. Null module →
// the main program; an unknown module gives 0 with ERROR_MOD_NOT_FOUND.
VYN_API DWORD GetModuleFileNameW(HMODULE module, MCHAR* buffer, DWORD size);

}  // namespace win32

namespace win32::detail {

// The handle of the loaded module whose image contains address (as GetModuleHandleExW with
// GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | ..._UNCHANGED_REFCOUNT), or null.
VYN_API HMODULE ModuleOfAddress(const void* address) noexcept;

}  // namespace win32::detail
