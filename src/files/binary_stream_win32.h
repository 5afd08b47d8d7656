#pragma once
// BinaryStreamWin32: a binary stream over a Win32 file handle.

#include "vynutil/binary_stream.h"

namespace VynSDK::Util {

class BinaryStreamWin32 final : public BinaryStream {
 public:
  // With owns the stream closes the handle.
  BinaryStreamWin32(HANDLE handle, bool owns) noexcept : handle_(handle), owns_(owns) {}
  ~BinaryStreamWin32() override;

  // The system message of the saved error code, or a null string when none was saved.
  VynString LastError() override;
  // Set by a read that moved nothing or met ERROR_HANDLE_EOF; cleared by a successful write, seek
  // or truncation.
  bool IsEndOfFile() const override;
  bool CanWrite() const override;
  std::size_t Read(void* buffer, std::size_t bytes) override;
  std::size_t Write(const void* data, std::size_t bytes) override;
  LONGLONG Seek(LONGLONG offset, int origin) override;
  void Flush() override;
  void Truncate() override;

 private:
  HANDLE handle_;
  DWORD error_ = 0;  // Win32 code of the last failure, 0 when none
  bool owns_;
  bool endOfFile_ = false;
};

}  // namespace VynSDK::Util
