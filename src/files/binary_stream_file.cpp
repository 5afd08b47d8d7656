// BinaryStreamFile: reads, writes, seeks and cuts through the C runtime's stream functions.
//
// Every call that may write buffered data to the file runs with the file-size signal held back,
// so a process file-size limit makes the write fail with an error instead of ending the process.

#include "files/binary_stream_file.h"

#include <cerrno>

#include "files/binary_stream_pieces.h"
#include "win32/crt_file.h"

namespace VynSDK::Util {

using stream_pieces::Moved;
using stream_pieces::TransferInPieces;

BinaryStreamFile::~BinaryStreamFile() {
  if (!owns_) return;
  win32::fclose(file_);
}

VynString BinaryStreamFile::LastError() {
  return error_ != 0 ? VynString::FromAnsiError(error_) : VynString();
}

bool BinaryStreamFile::IsEndOfFile() const { return std::feof(file_) != 0; }

bool BinaryStreamFile::CanWrite() const { return true; }

void BinaryStreamFile::SaveErrno(int fallback) { error_ = errno != 0 ? errno : fallback; }

void BinaryStreamFile::SwitchTo(LastTransfer next) {
  if (last_ == next) return;
  if (last_ == LastTransfer::Write) {
    errno = 0;
    if (win32::fflush(file_) != 0) SaveErrno(EIO);
  } else if (last_ == LastTransfer::Read) {
    win32::_fseeki64(file_, 0, SEEK_CUR);
  }
  last_ = next;
}

std::size_t BinaryStreamFile::Read(void* buffer, std::size_t bytes) {
  if (bytes == 0) return 0;
  if (buffer == nullptr) {
    error_ = EINVAL;
    return 0;
  }
  SwitchTo(LastTransfer::Read);
  auto* to = static_cast<std::byte*>(buffer);
  return TransferInPieces(bytes, [&](std::size_t offset, std::size_t piece) {
    errno = 0;
    const std::size_t got = win32::fread(to + offset, 1, piece, file_);
    // fread comes back short only at the end of the file, which is no failure, or on an error.
    if (got < piece && std::feof(file_) == 0) SaveErrno(EIO);
    return Moved{got, got < piece};
  });
}

std::size_t BinaryStreamFile::Write(const void* data, std::size_t bytes) {
  if (bytes == 0) return 0;
  if (data == nullptr) {
    error_ = EINVAL;
    return 0;
  }
  SwitchTo(LastTransfer::Write);
  const auto* from = static_cast<const std::byte*>(data);
  return TransferInPieces(bytes, [&](std::size_t offset, std::size_t piece) {
    errno = 0;
    const std::size_t put = win32::fwrite(from + offset, 1, piece, file_);
    // fwrite comes back short only on an error. The runtime's stream is not to be trusted with
    // more after that (another call may take bytes into its buffer and drop them), so the
    // transfer ends here.
    if (put < piece) SaveErrno(EIO);
    return Moved{put, put < piece};
  });
}

LONGLONG BinaryStreamFile::Seek(LONGLONG offset, int origin) {
  last_ = LastTransfer::None;
  errno = 0;
  if (win32::_fseeki64(file_, offset, origin) != 0) {
    SaveErrno(EINVAL);
    return -1;
  }
  const LONGLONG position = win32::_ftelli64(file_);
  if (position < 0) SaveErrno(EINVAL);
  return position < 0 ? -1 : position;
}

void BinaryStreamFile::Flush() {
  last_ = LastTransfer::None;
  errno = 0;
  if (win32::fflush(file_) != 0) SaveErrno(EIO);
}

void BinaryStreamFile::Truncate() {
  Flush();
  errno = 0;
  const LONGLONG position = win32::_ftelli64(file_);
  if (position < 0) {
    SaveErrno(EINVAL);
    return;
  }
  const win32::errno_t error = win32::_chsize_s(win32::_fileno(file_), position);
  if (error != 0) error_ = error;
}

}  // namespace VynSDK::Util
