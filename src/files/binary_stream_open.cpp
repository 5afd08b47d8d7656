// BinaryStream::FromFilename: Mode flags to the arguments of CreateFileW, and the open itself.

#include "vynutil/binary_stream.h"

#include "files/binary_stream_win32.h"
#include "vynutil/path.h"
#include "win32/file_handle.h"
#include "win32/last_error.h"

namespace VynSDK::Util {

namespace {

using Stream = BinaryStream;

struct OpenArguments {
  DWORD access = 0;
  DWORD share = 0;
  DWORD disposition = 0;
  DWORD flags = 0;
};

// Truncating needs write access (CreateFileW refuses TRUNCATE_EXISTING without it), so a mode
// that truncates writes as well, and the file's old contents are at stake as with writing.
bool ChangesContents(unsigned mode) {
  return (mode & (Stream::ModeWrite | Stream::ModeAppend | Stream::ModeTruncate)) != 0;
}

OpenArguments ArgumentsFor(unsigned mode) {
  OpenArguments open;
  if (mode & Stream::ModeAppend) {
    open.access = win32::GENERIC_READ | win32::GENERIC_WRITE;
  } else {
    if (mode & Stream::ModeRead) open.access |= win32::GENERIC_READ;
    if (ChangesContents(mode)) open.access |= win32::GENERIC_WRITE;
  }

  if (!(mode & Stream::ModeExclusive)) open.share |= win32::FILE_SHARE_READ;
  if (mode & Stream::ModeDeleteOnClose) open.share |= win32::FILE_SHARE_DELETE;

  const bool truncate = (mode & Stream::ModeTruncate) != 0;
  if (mode & Stream::ModeCreate) {
    open.disposition = truncate ? win32::CREATE_ALWAYS : win32::OPEN_ALWAYS;
  } else {
    open.disposition = truncate ? win32::TRUNCATE_EXISTING : win32::OPEN_EXISTING;
  }

  open.flags = win32::FILE_ATTRIBUTE_NORMAL;
  if (mode & Stream::ModeTemporary) {
    open.flags |= win32::FILE_ATTRIBUTE_TEMPORARY;
  } else if (mode & Stream::ModeWriteThrough) {
    open.flags |= win32::FILE_FLAG_WRITE_THROUGH;
  }
  if (mode & Stream::ModeDeleteOnClose) open.flags |= win32::FILE_FLAG_DELETE_ON_CLOSE;
  if (mode & Stream::ModeRandomAccess) {
    open.flags |= win32::FILE_FLAG_RANDOM_ACCESS;
  } else if (mode & Stream::ModeSequentialScan) {
    open.flags |= win32::FILE_FLAG_SEQUENTIAL_SCAN;
  }
  return open;
}

}  // namespace

BinaryStream* BinaryStream::FromFilename(const VynString& path, unsigned mode, VynString* error) {
  const VynStringCast<MCHAR> name = path.ToUTF16();
  if (ChangesContents(mode) && !(mode & (ModeTemporary | ModeDeleteOnClose))) {
    Path(name.Get()).SaveBaseFile();
  }
  const OpenArguments open = ArgumentsFor(mode);
  HANDLE handle = win32::CreateFileW(name, open.access, open.share, nullptr, open.disposition,
                                     open.flags, nullptr);
  if (handle == INVALID_HANDLE_VALUE) {
    const DWORD code = win32::GetLastError();
    if (error != nullptr) *error = VynString::FromWin32Error(code);
    return nullptr;
  }
  BinaryStream* stream = FromFileHandle(handle, true);
  if (stream == nullptr) {
    win32::CloseHandle(handle);
    if (error != nullptr) *error = VynString::FromWin32Error(win32::ERROR_NOT_ENOUGH_MEMORY);
  }
  return stream;
}

BinaryStream* BinaryStream::FromFilename(const VynString& path, bool write, bool truncate,
                                         bool exclusive, VynString* error) {
  unsigned mode = ModeRead;
  if (write) mode |= ModeWrite | ModeCreate;
  if (truncate) mode |= ModeTruncate;
  if (exclusive) mode |= ModeExclusive;
  return FromFilename(path, mode, error);
}

}  // namespace VynSDK::Util
