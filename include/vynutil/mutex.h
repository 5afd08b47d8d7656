#pragma once
// Named system mutexes: shared between threads and processes by name, recursive for the owning
// thread. Failures are reported on the debug output and as Win32 error codes; nothing throws.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util {

// A mutex, named (shared with every process that opens the same name) or unnamed, with explicit
// acquisition and release. The object holds one handle; it cannot be copied.
class VYN_API MutexObject {
 public:
  // Creates the mutex, or opens the existing one of that name; a null name makes an unnamed one.
  // On failure the handle stays null and the failure is written to the debug output.
  explicit MutexObject(const MCHAR* name);
  // The same for a name in the ANSI code page.
  explicit MutexObject(const char* name);
  ~MutexObject();
  MutexObject(const MutexObject&) = delete;
  MutexObject& operator=(const MutexObject&) = delete;

  // Waits up to timeout milliseconds (INFINITE waits without limit). Returns WAIT_OBJECT_0,
  // WAIT_ABANDONED (the previous owner died; the caller owns it now) or WAIT_TIMEOUT; the Win32
  // error code when the wait fails; ERROR_INVALID_HANDLE without a mutex.
  DWORD Acquire(DWORD timeout);
  // Releases one acquisition: 0, the Win32 error code (ERROR_NOT_OWNER when the calling thread
  // does not own it), or ERROR_INVALID_HANDLE without a mutex.
  DWORD Release();

 private:
  HANDLE m_handle = nullptr;
};

// Holds a MutexObject for a scope: acquires it on construction and releases it on destruction
// when the acquisition gave ownership. Must not outlive its mutex.
class VYN_API AutoMutex {
 public:
  AutoMutex(MutexObject& mutex, DWORD timeout);
  ~AutoMutex();
  AutoMutex(const AutoMutex&) = delete;
  AutoMutex& operator=(const AutoMutex&) = delete;

  // The result of the acquisition (see MutexObject::Acquire).
  DWORD GetWaitResult() const;

 private:
  MutexObject* m_mutex;
  DWORD m_waitResult;
};

// A mutex named after a file, acquired on construction: every process that names the same file
// (in any letter case, with "\" or "/") waits for the same mutex. Used around INI and log files.
class VYN_API FileMutexObject {
 public:
  // Waits up to timeout milliseconds for the file's mutex. A null or empty path takes no mutex
  // and counts as acquired. A mutex whose previous owner died is acquired as well.
  FileMutexObject(const MCHAR* path, DWORD timeout);
  ~FileMutexObject();
  FileMutexObject(const FileMutexObject&) = delete;
  FileMutexObject& operator=(const FileMutexObject&) = delete;

  // Whether the caller may proceed: the mutex is held (or there was nothing to lock).
  bool MutexAquired();
  // Releases the mutex now (when held) and closes it; the destructor then does nothing more.
  void ReleaseMutex();

 private:
  HANDLE m_handle = nullptr;
  bool m_acquired = false;
};

}  // namespace VynSDK::Util
