// BinaryStreamWin32: reads, writes, seeks and cuts through the calls on Win32 file handles.

#include "files/binary_stream_win32.h"

#include "files/binary_stream_pieces.h"
#include "win32/file_handle.h"
#include "win32/handles.h"
#include "win32/last_error.h"

namespace VynSDK::Util {

using stream_pieces::Moved;
using stream_pieces::TransferInPieces;

BinaryStreamWin32::~BinaryStreamWin32() {
  if (owns_) win32::CloseHandle(handle_);
}

VynString BinaryStreamWin32::LastError() {
  return error_ != 0 ? VynString::FromWin32Error(error_) : VynString();
}

bool BinaryStreamWin32::IsEndOfFile() const { return endOfFile_; }

bool BinaryStreamWin32::CanWrite() const { return true; }

std::size_t BinaryStreamWin32::Read(void* buffer, std::size_t bytes) {
  auto* to = static_cast<std::byte*>(buffer);
  return TransferInPieces(bytes, [&](std::size_t offset, std::size_t piece) {
    DWORD got = 0;
    if (!win32::ReadFile(handle_, to + offset, static_cast<DWORD>(piece), &got, nullptr)) {
      error_ = win32::GetLastError();
      if (error_ == win32::ERROR_HANDLE_EOF) endOfFile_ = true;
      return Moved{got, true};
    }
    if (got == 0) endOfFile_ = true;
    return Moved{got, false};
  });
}

std::size_t BinaryStreamWin32::Write(const void* data, std::size_t bytes) {
  const auto* from = static_cast<const std::byte*>(data);
  return TransferInPieces(bytes, [&](std::size_t offset, std::size_t piece) {
    DWORD put = 0;
    if (!win32::WriteFile(handle_, from + offset, static_cast<DWORD>(piece), &put, nullptr)) {
      error_ = win32::GetLastError();
      return Moved{put, true};
    }
    endOfFile_ = false;
    return Moved{put, false};
  });
}

LONGLONG BinaryStreamWin32::Seek(LONGLONG offset, int origin) {
  win32::LARGE_INTEGER distance{};
  win32::LARGE_INTEGER position{};
  distance.QuadPart = offset;
  if (!win32::SetFilePointerEx(handle_, distance, &position, static_cast<DWORD>(origin))) {
    error_ = win32::GetLastError();
    return -1;
  }
  endOfFile_ = false;
  return position.QuadPart;
}

void BinaryStreamWin32::Flush() { win32::FlushFileBuffers(handle_); }

void BinaryStreamWin32::Truncate() {
  if (win32::SetEndOfFile(handle_)) {
    endOfFile_ = false;
  } else {
    error_ = win32::GetLastError();
  }
}

}  // namespace VynSDK::Util
