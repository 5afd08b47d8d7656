#pragma once
// Files opened as Win32 handles: CreateFileW and the calls on its handles. Paths are
// Windows-form (see path_map.h). Share modes hold between handles of this process and, through
// file locks, between processes (see file_sharing.h). Handles are checked before use: a closed
// or made-up handle gives ERROR_INVALID_HANDLE.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"
#include "win32/file_types.h"
#include "win32/handles.h"

namespace win32 {

// Access rights.
inline constexpr DWORD GENERIC_READ = 0x80000000;
inline constexpr DWORD GENERIC_WRITE = 0x40000000;
inline constexpr DWORD GENERIC_ALL = 0x10000000;
inline constexpr DWORD DELETE = 0x00010000;
// Share modes: what other handles of the same file may do.
inline constexpr DWORD FILE_SHARE_READ = 0x1;
inline constexpr DWORD FILE_SHARE_WRITE = 0x2;
inline constexpr DWORD FILE_SHARE_DELETE = 0x4;
// Creation dispositions.
inline constexpr DWORD CREATE_NEW = 1;
inline constexpr DWORD CREATE_ALWAYS = 2;
inline constexpr DWORD OPEN_EXISTING = 3;
inline constexpr DWORD OPEN_ALWAYS = 4;
inline constexpr DWORD TRUNCATE_EXISTING = 5;
// Flags (attributes are the FILE_ATTRIBUTE_ values of file_types.h).
inline constexpr DWORD FILE_FLAG_WRITE_THROUGH = 0x80000000;
inline constexpr DWORD FILE_FLAG_RANDOM_ACCESS = 0x10000000;
inline constexpr DWORD FILE_FLAG_SEQUENTIAL_SCAN = 0x08000000;
inline constexpr DWORD FILE_FLAG_DELETE_ON_CLOSE = 0x04000000;
// Move methods of SetFilePointerEx.
inline constexpr DWORD FILE_BEGIN = 0;
inline constexpr DWORD FILE_CURRENT = 1;
inline constexpr DWORD FILE_END = 2;

// Asynchronous transfers are not offered; the parameter must be null.
struct OVERLAPPED;

// Opens or creates a file and returns its handle, or INVALID_HANDLE_VALUE with the last error:
//   CREATE_NEW: a new file; ERROR_FILE_EXISTS when one exists.
//   CREATE_ALWAYS: a new file, or the existing one cut to 0 bytes (last error
//     ERROR_ALREADY_EXISTS, on success).
//   OPEN_EXISTING: ERROR_FILE_NOT_FOUND when missing (ERROR_PATH_NOT_FOUND when its folder is).
//   OPEN_ALWAYS: the existing file (last error ERROR_ALREADY_EXISTS) or a new one.
//   TRUNCATE_EXISTING: the existing file cut to 0 bytes; needs GENERIC_WRITE.
// On success without an existing file the last error is ERROR_SUCCESS. Access is GENERIC_READ,
// GENERIC_WRITE, GENERIC_ALL, DELETE (other bits are accepted and grant nothing more). A folder
// cannot be opened (ERROR_ACCESS_DENIED); neither can a read-only file (one without write
// permission for its owner) for writing or with FILE_FLAG_DELETE_ON_CLOSE, whoever the caller
// is. An open that conflicts with the share modes of open handles fails with
// ERROR_SHARING_VIOLATION before anything is truncated. Flags: FILE_ATTRIBUTE_READONLY makes a
// new file read-only (this handle still writes); FILE_FLAG_WRITE_THROUGH writes through to the
// device (O_DSYNC); FILE_FLAG_DELETE_ON_CLOSE deletes the file when the last handle of this
// process to it closes (it implies DELETE access, so later opens need FILE_SHARE_DELETE);
// FILE_FLAG_SEQUENTIAL_SCAN and FILE_FLAG_RANDOM_ACCESS become read-ahead hints;
// FILE_ATTRIBUTE_NORMAL and FILE_ATTRIBUTE_TEMPORARY change nothing. Security attributes and
// the template file are ignored. ERROR_INVALID_PARAMETER for an unknown disposition or share
// bit; ERROR_PATH_NOT_FOUND for a null or empty name.
VYN_API HANDLE CreateFileW(LPCWSTR lpFileName, DWORD dwDesiredAccess, DWORD dwShareMode,
                           LPSECURITY_ATTRIBUTES lpSecurityAttributes, DWORD dwCreationDisposition,
                           DWORD dwFlagsAndAttributes, HANDLE hTemplateFile);

// Reads up to nNumberOfBytesToRead bytes at the file pointer; *lpNumberOfBytesRead receives the
// count, fewer at the end of the file and 0 there (TRUE all the same). FALSE with
// ERROR_ACCESS_DENIED without read access, ERROR_INVALID_PARAMETER for a null count pointer, a
// null buffer or an OVERLAPPED.
VYN_API BOOL ReadFile(HANDLE hFile, void* lpBuffer, DWORD nNumberOfBytesToRead,
                      DWORD* lpNumberOfBytesRead, OVERLAPPED* lpOverlapped);
// Writes nNumberOfBytesToWrite bytes at the file pointer (a pointer past the end leaves a gap
// that reads as zeros). When the device is full, a quota is reached or the process's file-size
// limit stops the write, FALSE with ERROR_DISK_FULL and *lpNumberOfBytesWritten holding what was
// written; the limit never raises SIGXFSZ. Other failures as ReadFile (ERROR_ACCESS_DENIED
// without write access).
VYN_API BOOL WriteFile(HANDLE hFile, const void* lpBuffer, DWORD nNumberOfBytesToWrite,
                       DWORD* lpNumberOfBytesWritten, OVERLAPPED* lpOverlapped);
// Moves the file pointer by liDistanceToMove from the start, the current position or the end
// (FILE_BEGIN, FILE_CURRENT, FILE_END); the new position goes to *lpNewFilePointer when that is
// not null. Positions past the end are allowed; a negative one fails with ERROR_NEGATIVE_SEEK
// and leaves the pointer; another method gives ERROR_INVALID_PARAMETER.
VYN_API BOOL SetFilePointerEx(HANDLE hFile, LARGE_INTEGER liDistanceToMove,
                              PLARGE_INTEGER lpNewFilePointer, DWORD dwMoveMethod);
// Makes the file end at the file pointer (cutting or extending it with zeros). Needs write
// access (ERROR_ACCESS_DENIED); ERROR_DISK_FULL as WriteFile.
VYN_API BOOL SetEndOfFile(HANDLE hFile);
// Writes the file's data and metadata through to the device (fsync). Needs write access.
VYN_API BOOL FlushFileBuffers(HANDLE hFile);
// The file's size in bytes.
VYN_API BOOL GetFileSizeEx(HANDLE hFile, PLARGE_INTEGER lpFileSize);

}  // namespace win32
