// CreateFileW: the Win32 parameters turned into an open request, and the handle registered.

#include <fcntl.h>

#include "file_object.h"
#include "path_errors.h"
#include "win32/file_handle.h"
#include "win32/last_error.h"

namespace win32 {

namespace {

constexpr DWORD kFileReadData = 0x1;
constexpr DWORD kFileWriteData = 0x2;
constexpr DWORD kFileAppendData = 0x4;

unsigned RightsOf(DWORD access) {
  unsigned rights = 0;
  if ((access & (GENERIC_READ | GENERIC_ALL | kFileReadData)) != 0) rights |= detail::kRightRead;
  if ((access & (GENERIC_WRITE | GENERIC_ALL | kFileWriteData | kFileAppendData)) != 0) {
    rights |= detail::kRightWrite;
  }
  if ((access & (DELETE | GENERIC_ALL)) != 0) rights |= detail::kRightDelete;
  return rights;
}

int AdviceOf(DWORD flags) {
  if ((flags & FILE_FLAG_RANDOM_ACCESS) != 0) return POSIX_FADV_RANDOM;
  if ((flags & FILE_FLAG_SEQUENTIAL_SCAN) != 0) return POSIX_FADV_SEQUENTIAL;
  return 0;
}

HANDLE Fail(DWORD error) {
  SetLastError(error);
  return INVALID_HANDLE_VALUE;
}

}  // namespace

HANDLE CreateFileW(LPCWSTR lpFileName, DWORD dwDesiredAccess, DWORD dwShareMode,
                   LPSECURITY_ATTRIBUTES, DWORD dwCreationDisposition, DWORD dwFlagsAndAttributes,
                   HANDLE) {
  detail::OpenRequest request;
  request.rights = RightsOf(dwDesiredAccess);
  request.share = dwShareMode;
  request.disposition = dwCreationDisposition;
  if (dwCreationDisposition < CREATE_NEW || dwCreationDisposition > TRUNCATE_EXISTING ||
      (dwShareMode & ~detail::kAllRights) != 0 ||
      (dwCreationDisposition == TRUNCATE_EXISTING && (request.rights & detail::kRightWrite) == 0)) {
    return Fail(ERROR_INVALID_PARAMETER);
  }
  std::string path;
  if (!detail::MapPathArgument(lpFileName, &path)) return INVALID_HANDLE_VALUE;
  request.writeThrough = (dwFlagsAndAttributes & FILE_FLAG_WRITE_THROUGH) != 0;
  request.deleteOnClose = (dwFlagsAndAttributes & FILE_FLAG_DELETE_ON_CLOSE) != 0;
  request.createReadOnly = (dwFlagsAndAttributes & FILE_ATTRIBUTE_READONLY) != 0;
  request.advice = AdviceOf(dwFlagsAndAttributes);

  detail::OpenOutcome outcome = detail::OpenFileObject(path, request);
  if (outcome.file == nullptr) return Fail(outcome.error);
  const bool reportsExisting = outcome.existed && (dwCreationDisposition == CREATE_ALWAYS ||
                                                   dwCreationDisposition == OPEN_ALWAYS);
  HANDLE handle = detail::RegisterHandle(std::move(outcome.file));
  SetLastError(reportsExisting ? ERROR_ALREADY_EXISTS : ERROR_SUCCESS);
  return handle;
}

}  // namespace win32
