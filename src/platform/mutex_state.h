#pragma once
// The state of one mutex object: a robust, recursive pthread mutex, and the Win32 wait and
// release over it. The same record serves unnamed mutexes (in the process's heap) and named ones
// (in shared memory, seen by every process that has the name open).

#include <pthread.h>

#include "vynutil/wintypes.h"

namespace win32::detail {

struct MutexState {
  pthread_mutex_t mutex;
};

// Makes state a free mutex: recursive, robust, and process-shared when shared. 0 or an errno.
int InitMutexState(MutexState* state, bool shared) noexcept;

// WaitForSingleObject on the mutex: WAIT_OBJECT_0, WAIT_ABANDONED (the caller now owns a mutex
// whose owner ended holding it), WAIT_TIMEOUT, or WAIT_FAILED with the last error set.
DWORD WaitForMutexState(MutexState* state, DWORD milliseconds) noexcept;

// ReleaseMutex on the mutex: FALSE with ERROR_NOT_OWNER unless the calling thread owns it.
BOOL ReleaseMutexState(MutexState* state) noexcept;

// True when a live thread of this process owns the mutex. Such a mutex must stay mapped: the
// owner's thread library keeps it linked in the thread's list of robust mutexes, which it walks
// and rewrites when the thread locks, unlocks or ends.
bool IsOwnedInThisProcess(const MutexState& state) noexcept;

}  // namespace win32::detail
