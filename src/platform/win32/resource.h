#pragma once
// Resources of a module, as LoadStringW and the FindResource family give them. The tables come
// from the module's VYN_MODULE_RESOURCES declaration. The language is chosen for each resource as
// Windows chooses it: the thread's UI language (GetThreadUILanguage), then the same primary
// language, then neutral (primary language 0), then English (United States), then the module's
// other tables in their order; the first table that has the resource gives it.

#include "vynutil/export.h"
#include "vynutil/module_resources.h"
#include "vynutil/wintypes.h"

struct HRSRC__;
using HRSRC = HRSRC__*;

// A resource number in the place of a resource name or type.
#define MAKEINTRESOURCEW(i) \
  (reinterpret_cast<LPCWSTR>(static_cast<ULONG_PTR>(static_cast<WORD>(i))))
#define IS_INTRESOURCE(p) ((reinterpret_cast<ULONG_PTR>(p) >> 16) == 0)
#define RT_BITMAP MAKEINTRESOURCEW(2)
#define RT_STRING MAKEINTRESOURCEW(6)

namespace win32 {

// String resource id (its low 16 bits, as in a Windows string table) of module; an empty string
// counts as missing. bufferMax 0: *buffer (taken as const MCHAR**) receives a read-only pointer
// to the text, valid while the module is loaded, and the result is its length. Otherwise copies
// at most bufferMax − 1 units and a terminator; returns the units copied. 0 when the module has
// no such string (ERROR_RESOURCE_NAME_NOT_FOUND) or no resources, or module is null
// (ERROR_RESOURCE_DATA_NOT_FOUND), with an empty text in a buffer of bufferMax > 0; a null
// buffer or a negative bufferMax gives 0 with ERROR_INVALID_PARAMETER.
VYN_API int LoadStringW(HINSTANCE module, UINT id, MCHAR* buffer, int bufferMax);
// Finds a binary resource by number (MAKEINTRESOURCEW) and type; null with
// ERROR_RESOURCE_TYPE_NOT_FOUND (no resource of that type in any language),
// ERROR_RESOURCE_NAME_NOT_FOUND, or ERROR_RESOURCE_DATA_NOT_FOUND (the module has no resources).
// Names given as text are not supported (null, ERROR_RESOURCE_NAME_NOT_FOUND). Null module → the
// main program.
VYN_API HRSRC FindResourceW(HMODULE module, LPCWSTR name, LPCWSTR type);
// The resource's data handle (valid while the module is loaded), or null with
// ERROR_INVALID_HANDLE for a null resource or one that no loaded module has registered.
VYN_API HGLOBAL LoadResource(HMODULE module, HRSRC resource);
// The resource's size in bytes; 0 with ERROR_INVALID_HANDLE as LoadResource.
VYN_API DWORD SizeofResource(HMODULE module, HRSRC resource);
// The first byte of a loaded resource (read-only), or null.
VYN_API void* LockResource(HGLOBAL data);

}  // namespace win32
