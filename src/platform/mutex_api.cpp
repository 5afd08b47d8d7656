// CreateMutexW, CreateMutexA, OpenMutexW, ReleaseMutex and WaitForSingleObject.

#include <memory>
#include <string>

#include "mutex_handle.h"
#include "mutex_names.h"
#include "mutex_named_table.h"
#include "mutex_state.h"
#include "win32/codepage.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"
#include "win32/sync.h"

namespace win32 {

namespace {

HANDLE Fail(DWORD error) {
  SetLastError(error);
  return nullptr;
}

HANDLE NewUnnamedMutex(bool initialOwner) {
  auto state = std::make_unique<detail::MutexState>();
  if (const int error = detail::InitMutexState(state.get(), false)) return Fail(ErrorFromErrno(error));
  detail::MutexState* raw = state.get();
  auto mutex = std::make_shared<detail::MutexHandle>(std::move(state));
  if (initialOwner) detail::WaitForMutexState(raw, 0);
  SetLastError(ERROR_SUCCESS);
  return detail::RegisterMutexHandle(std::move(mutex));
}

HANDLE NewNamedMutexHandle(const detail::MutexName& name, detail::SharedMutexObject::Mode mode,
                           bool initialOwner) {
  detail::NamedMutex* named = nullptr;
  bool existed = false;
  const DWORD error = detail::AddNamedMutexHandle(name, mode, initialOwner, &named, &existed);
  if (error != ERROR_SUCCESS) return Fail(error);
  const HANDLE handle = detail::RegisterMutexHandle(std::make_shared<detail::MutexHandle>(named));
  SetLastError(existed ? ERROR_ALREADY_EXISTS : ERROR_SUCCESS);
  return handle;
}

}  // namespace

HANDLE CreateMutexW(LPSECURITY_ATTRIBUTES, BOOL bInitialOwner, LPCWSTR lpName) {
  detail::MutexName name;
  if (const DWORD error = detail::ParseMutexName(lpName, &name)) return Fail(error);
  if (name.name.empty()) return NewUnnamedMutex(bInitialOwner != FALSE);
  return NewNamedMutexHandle(name, detail::SharedMutexObject::Mode::kOpenOrCreate, bInitialOwner != FALSE);
}

HANDLE CreateMutexA(LPSECURITY_ATTRIBUTES attributes, BOOL bInitialOwner, LPCSTR lpName) {
  if (lpName == nullptr) return CreateMutexW(attributes, bInitialOwner, nullptr);
  const int units = MultiByteToWideChar(CP_ACP, 0, lpName, -1, nullptr, 0);
  if (units <= 0) return nullptr;
  std::u16string name(static_cast<std::size_t>(units), u'\0');
  MultiByteToWideChar(CP_ACP, 0, lpName, -1, name.data(), units);
  return CreateMutexW(attributes, bInitialOwner, name.c_str());
}

HANDLE OpenMutexW(DWORD, BOOL, LPCWSTR lpName) {
  detail::MutexName name;
  if (const DWORD error = detail::ParseMutexName(lpName, &name)) return Fail(error);
  if (name.name.empty()) return Fail(ERROR_INVALID_PARAMETER);
  const HANDLE handle = NewNamedMutexHandle(name, detail::SharedMutexObject::Mode::kOpenExisting, false);
  if (handle != nullptr) SetLastError(ERROR_SUCCESS);
  return handle;
}

BOOL ReleaseMutex(HANDLE hMutex) {
  const std::shared_ptr<detail::MutexHandle> mutex = detail::FindMutexHandle(hMutex);
  if (mutex == nullptr) {
    SetLastError(ERROR_INVALID_HANDLE);
    return FALSE;
  }
  return detail::ReleaseMutexState(mutex->state());
}

DWORD WaitForSingleObject(HANDLE hHandle, DWORD dwMilliseconds) {
  const std::shared_ptr<detail::MutexHandle> mutex = detail::FindMutexHandle(hHandle);
  if (mutex == nullptr) {
    SetLastError(ERROR_INVALID_HANDLE);
    return WAIT_FAILED;
  }
  return detail::WaitForMutexState(mutex->state(), dwMilliseconds);
}

}  // namespace win32
