// Waiting on and releasing a robust, recursive pthread mutex with Win32 results.

#include "mutex_state.h"

#include <unistd.h>

#include <cerrno>
#include <ctime>
#include <string>

#include "win32/errno_map.h"
#include "win32/last_error.h"

#if defined(__SANITIZE_THREAD__)
#include <sanitizer/tsan_interface.h>
#endif

namespace win32::detail {

namespace {

// The monotonic time milliseconds from now.
timespec DeadlineAfter(DWORD milliseconds) {
  timespec deadline{};
  clock_gettime(CLOCK_MONOTONIC, &deadline);
  deadline.tv_sec += milliseconds / 1000;
  deadline.tv_nsec += static_cast<long>(milliseconds % 1000) * 1'000'000;
  if (deadline.tv_nsec >= 1'000'000'000) {
    deadline.tv_sec += 1;
    deadline.tv_nsec -= 1'000'000'000;
  }
  return deadline;
}

// pthread_mutex_clocklock, which the thread sanitizer does not intercept: it is told about the
// lock by hand, as for a try-lock.
int LockBefore(pthread_mutex_t* mutex, const timespec& deadline) {
#if defined(__SANITIZE_THREAD__)
  __tsan_mutex_pre_lock(mutex, __tsan_mutex_try_lock);
  const int result = pthread_mutex_clocklock(mutex, CLOCK_MONOTONIC, &deadline);
  const bool locked = result == 0 || result == EOWNERDEAD;
  __tsan_mutex_post_lock(mutex, locked ? __tsan_mutex_try_lock : __tsan_mutex_try_lock_failed, 0);
  return result;
#else
  return pthread_mutex_clocklock(mutex, CLOCK_MONOTONIC, &deadline);
#endif
}

}  // namespace

int InitMutexState(MutexState* state, bool shared) noexcept {
  pthread_mutexattr_t attributes;
  int result = pthread_mutexattr_init(&attributes);
  if (result != 0) return result;
  result = pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_RECURSIVE);
  if (result == 0) result = pthread_mutexattr_setrobust(&attributes, PTHREAD_MUTEX_ROBUST);
  if (result == 0 && shared) result = pthread_mutexattr_setpshared(&attributes, PTHREAD_PROCESS_SHARED);
  if (result == 0) result = pthread_mutex_init(&state->mutex, &attributes);
  pthread_mutexattr_destroy(&attributes);
  return result;
}

DWORD WaitForMutexState(MutexState* state, DWORD milliseconds) noexcept {
  int result;
  if (milliseconds == 0) {
    result = pthread_mutex_trylock(&state->mutex);
  } else if (milliseconds == INFINITE) {
    result = pthread_mutex_lock(&state->mutex);
  } else {
    result = LockBefore(&state->mutex, DeadlineAfter(milliseconds));
  }
  switch (result) {
    case 0:
      return WAIT_OBJECT_0;
    case EOWNERDEAD:
      // The caller owns it now; marking it consistent keeps it usable after this owner's release.
      pthread_mutex_consistent(&state->mutex);
      return WAIT_ABANDONED;
    case EBUSY:
    case ETIMEDOUT:
      return WAIT_TIMEOUT;
    default:
      SetLastError(ErrorFromErrno(result));
      return WAIT_FAILED;
  }
}

BOOL ReleaseMutexState(MutexState* state) noexcept {
#if defined(__SANITIZE_THREAD__)
  // The thread sanitizer takes any unlock as done and reports a non-owner's; the mutex would
  // refuse it (EPERM) all the same.
  if (__atomic_load_n(&state->mutex.__data.__owner, __ATOMIC_RELAXED) != gettid()) {
    SetLastError(ERROR_NOT_OWNER);
    return FALSE;
  }
#endif
  const int result = pthread_mutex_unlock(&state->mutex);
  if (result == 0) return TRUE;
  SetLastError(result == EPERM ? ERROR_NOT_OWNER : ErrorFromErrno(result));
  return FALSE;
}

bool IsOwnedInThisProcess(const MutexState& state) noexcept {
  // The thread library records the owner's thread id in the mutex; it may be a thread of
  // another process, or one that has ended (the kernel has then taken the mutex off its list).
  const pid_t owner = __atomic_load_n(&state.mutex.__data.__owner, __ATOMIC_ACQUIRE);
  if (owner <= 0) return false;
  if (owner == gettid()) return true;
  const std::string task = "/proc/self/task/" + std::to_string(owner);
  return access(task.c_str(), F_OK) == 0;
}

}  // namespace win32::detail
