#pragma once
// Mutex objects as Win32 has them: unnamed ones private to the process, named ones shared by every
// process of the user that opens the name. A mutex belongs to at most one thread at a time, is
// recursive for that thread (each wait that succeeds needs its own ReleaseMutex), and passes to a
// waiter as abandoned (WAIT_ABANDONED) when its owner thread ends, or its process dies, holding it.
//
// Names are compared exactly (case matters; '/' is an ordinary character). "Local\" in front of a
// name changes nothing, as in a Windows session; "Global\" names live in a namespace of their
// own. Any other '\' in a name is an error (ERROR_PATH_NOT_FOUND), as there are no other object
// folders. An empty name is the same as none. A name longer than MAX_PATH units fails with
// ERROR_FILENAME_EXCED_RANGE.
//
// Where named mutexes live: each is a small POSIX shared-memory object holding a robust,
// recursive, process-shared pthread mutex, /dev/shm/vyn-mutex.1.<uid>.<L|G>.<name>, with the
// name written in UTF-8 and every byte outside [A-Za-z0-9._-] as %XX. A name whose object name
// would exceed what the system allows (255 bytes) is replaced by '#' and the SHA-256 of its
// UTF-16 units; the user id keeps users apart. The object lasts exactly as long as a Win32 mutex
// object: while some process has it open. Each process that has it open holds a shared file lock
// on it; the process that lets it go last (by its last CloseHandle, or at exit with handles still
// open), and finds no other lock holder, removes it. A process killed while it had the object
// open leaves it behind, but the next process to open it finds no lock holder and starts it
// afresh (so a left-over object is never reported as existing), and the last one to close it
// removes it. A child made by fork() shares its parent's hold on the objects open at the fork.
//
// All handles of a process to one name share one mapping, so opening a name the process has open
// already is a look-up without system calls. A mutex whose last handle in the process is closed
// while one of its threads owns it stays until that thread has ended (the thread library keeps
// owned robust mutexes on a list of the thread); it is then released as the next handle closes.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"
#include "win32/file_types.h"
#include "win32/handles.h"

namespace win32 {

using ::INFINITE;
using ::WAIT_ABANDONED;
using ::WAIT_FAILED;
using ::WAIT_OBJECT_0;
using ::WAIT_TIMEOUT;

// Access rights of OpenMutexW. Every handle may wait and release whatever it asks for.
inline constexpr DWORD MUTEX_MODIFY_STATE = 0x0001;
inline constexpr DWORD SYNCHRONIZE = 0x00100000;
inline constexpr DWORD MUTEX_ALL_ACCESS = 0x001F0001;

// Creates a mutex, or opens the named one that exists. On opening an existing one the last error
// is ERROR_ALREADY_EXISTS and bInitialOwner is ignored; on creating it is ERROR_SUCCESS, and with
// bInitialOwner the calling thread owns the new mutex. Returns null with the last error on
// failure (name errors as above; system failures mapped from errno). Security attributes are
// ignored. Close the handle with CloseHandle.
VYN_API HANDLE CreateMutexW(LPSECURITY_ATTRIBUTES lpMutexAttributes, BOOL bInitialOwner, LPCWSTR lpName);
// CreateMutexW with the name in the process's ANSI code page.
VYN_API HANDLE CreateMutexA(LPSECURITY_ATTRIBUTES lpMutexAttributes, BOOL bInitialOwner, LPCSTR lpName);
// Opens an existing named mutex; null with ERROR_FILE_NOT_FOUND when no process has it open,
// ERROR_INVALID_PARAMETER for a null or empty name. The access rights are not checked.
VYN_API HANDLE OpenMutexW(DWORD dwDesiredAccess, BOOL bInheritHandle, LPCWSTR lpName);

// Gives up one level of ownership; the mutex is free when every successful wait of the owner is
// matched. FALSE with ERROR_NOT_OWNER when the calling thread does not own it, ERROR_INVALID_HANDLE
// for anything but a live mutex handle.
VYN_API BOOL ReleaseMutex(HANDLE hMutex);

// Waits until the calling thread owns the mutex, or dwMilliseconds pass (0 only tries; INFINITE
// waits without end; the time is measured on the monotonic clock). Returns WAIT_OBJECT_0,
// WAIT_ABANDONED (the caller owns the mutex that its last owner left by ending; whatever it
// guarded may be half-changed), or WAIT_TIMEOUT. WAIT_FAILED with ERROR_INVALID_HANDLE for
// anything but a live mutex handle (closed handles, files, null, INVALID_HANDLE_VALUE).
// Waiting and releasing on a handle the thread used recently take no process-wide lock and
// allocate nothing.
VYN_API DWORD WaitForSingleObject(HANDLE hHandle, DWORD dwMilliseconds);

}  // namespace win32
