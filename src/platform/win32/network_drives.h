#pragma once
// Drive types and mapped network drives. A drive letter can be configured as a network drive
// connected to a UNC share "\\server\share": by SetMappedNetworkDrive, or by the environment
// variable TAVLO_PLATFORM_NETDRIVE_<LETTER> (for example TAVLO_PLATFORM_NETDRIVE_N=\\srv\data).
// Paths on such a drive map to the share's folder under the UNC root (see path_map.h), so
// "N:\a.txt" and "\\srv\data\a.txt" are the same file. The connected drives are what
// WNetOpenEnumW lists.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

inline constexpr UINT DRIVE_UNKNOWN = 0;
inline constexpr UINT DRIVE_NO_ROOT_DIR = 1;
inline constexpr UINT DRIVE_FIXED = 3;
inline constexpr UINT DRIVE_REMOTE = 4;

inline constexpr DWORD NO_ERROR = 0;
inline constexpr DWORD RESOURCE_CONNECTED = 0x1;
inline constexpr DWORD RESOURCETYPE_ANY = 0x0;
inline constexpr DWORD RESOURCETYPE_DISK = 0x1;
inline constexpr DWORD RESOURCETYPE_PRINT = 0x2;
inline constexpr DWORD RESOURCEDISPLAYTYPE_SHARE = 0x3;

struct NETRESOURCEW {
  DWORD dwScope;
  DWORD dwType;
  DWORD dwDisplayType;
  DWORD dwUsage;
  LPWSTR lpLocalName;   // "N:"
  LPWSTR lpRemoteName;  // "\\server\share"
  LPWSTR lpComment;     // null
  LPWSTR lpProvider;    // null
};

// Configures drive (a letter, either case) as connected to uncName, "\\server\share" (one final
// backslash is dropped). An empty name makes the drive no network drive, whatever the
// environment says; null returns it to the environment variable. False for another letter or a
// name that is not of the form \\server\share.
VYN_API bool SetMappedNetworkDrive(MCHAR drive, LPCWSTR uncName);

// The kind of a root: for "X:\" (also "X:" or "X:/") DRIVE_REMOTE when X is a network drive,
// DRIVE_FIXED when X's root folder (path_map.h) exists, DRIVE_NO_ROOT_DIR when it does not;
// DRIVE_REMOTE for "\\server\share\"; DRIVE_FIXED for "\" and for null (the current folder's
// root); DRIVE_NO_ROOT_DIR for anything that is not a root.
VYN_API UINT GetDriveTypeW(LPCWSTR lpRootPathName);

// Starts listing the connected network drives (dwScope RESOURCE_CONNECTED, dwType
// RESOURCETYPE_DISK or RESOURCETYPE_ANY; RESOURCETYPE_PRINT lists nothing) in letter order. The
// list is taken at this call. NO_ERROR with *lphEnum set; ERROR_NOT_SUPPORTED for another scope,
// ERROR_INVALID_PARAMETER for another type or a null lphEnum. The result is also the last error.
VYN_API DWORD WNetOpenEnumW(DWORD dwScope, DWORD dwType, DWORD dwUsage, NETRESOURCEW* lpNetResource,
                            HANDLE* lphEnum);
// Fills lpBuffer (*lpBufferSize bytes) with up to *lpcCount entries (0xFFFFFFFF: as many as fit):
// an array of NETRESOURCEW followed by their strings, all inside the buffer. NO_ERROR with
// *lpcCount set to the number written; ERROR_MORE_DATA with *lpBufferSize set to the bytes the
// next entry needs when not even one fits; ERROR_NO_MORE_ITEMS when the list is done;
// ERROR_INVALID_HANDLE for a handle that is not a live enumeration. The buffer must be aligned
// for NETRESOURCEW.
VYN_API DWORD WNetEnumResourceW(HANDLE hEnum, DWORD* lpcCount, void* lpBuffer, DWORD* lpBufferSize);
// Ends an enumeration: NO_ERROR, or ERROR_INVALID_HANDLE.
VYN_API DWORD WNetCloseEnum(HANDLE hEnum);

}  // namespace win32
