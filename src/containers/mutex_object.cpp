// MutexObject and AutoMutex: a Win32 mutex with explicit acquisition, and its scope guard.

#include "vynutil/mutex.h"

#include "foundation/debug_line.h"
#include "vynutil/vynstring.h"
#include "win32/last_error.h"
#include "win32/sync.h"

namespace VynSDK::Util {

namespace {

// The text of a Win32 error code for the failure lines.
VynString ErrorText(DWORD code) { return VynString::FromWin32Error(code); }

void ReportCreateFailure(const MCHAR* function, const VynString& name) {
  const DWORD code = win32::GetLastError();
  vyn::WriteDebugLine(u"%s(%s) error %d - %s\n", function, name.ToUTF16().Get(), static_cast<int>(code),
                      ErrorText(code).ToUTF16().Get());
}

}  // namespace

MutexObject::MutexObject(const MCHAR* name) : m_handle(win32::CreateMutexW(nullptr, FALSE, name)) {
  if (m_handle == nullptr) ReportCreateFailure(u"CreateMutexW", VynString::FromUTF16(name != nullptr ? name : u""));
}

MutexObject::MutexObject(const char* name) : m_handle(win32::CreateMutexA(nullptr, FALSE, name)) {
  if (m_handle == nullptr) ReportCreateFailure(u"CreateMutexA", VynString::FromACP(name != nullptr ? name : ""));
}

MutexObject::~MutexObject() {
  if (m_handle != nullptr) win32::CloseHandle(m_handle);
}

DWORD MutexObject::Acquire(DWORD timeout) {
  if (m_handle == nullptr) return win32::ERROR_INVALID_HANDLE;
  const DWORD result = win32::WaitForSingleObject(m_handle, timeout);
  if (result != WAIT_FAILED) return result;
  const DWORD code = win32::GetLastError();
  vyn::WriteDebugLine(u"Mutex Wait error %d - %s\n", static_cast<int>(code), ErrorText(code).ToUTF16().Get());
  return code;
}

DWORD MutexObject::Release() {
  if (m_handle == nullptr) return win32::ERROR_INVALID_HANDLE;
  if (win32::ReleaseMutex(m_handle)) return 0;
  const DWORD code = win32::GetLastError();
  vyn::WriteDebugLine(u"ReleaseMutex error %d - %s\n", static_cast<int>(code), ErrorText(code).ToUTF16().Get());
  return code;
}

AutoMutex::AutoMutex(MutexObject& mutex, DWORD timeout) : m_mutex(&mutex), m_waitResult(mutex.Acquire(timeout)) {}

// An abandoned mutex is owned as well: releasing only after WAIT_OBJECT_0 would keep it locked
// for every other thread and process.
AutoMutex::~AutoMutex() {
  if (m_waitResult == WAIT_OBJECT_0 || m_waitResult == WAIT_ABANDONED) m_mutex->Release();
}

DWORD AutoMutex::GetWaitResult() const { return m_waitResult; }

}  // namespace VynSDK::Util
