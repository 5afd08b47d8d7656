#pragma once
// BinaryStreamFile: a binary stream over a C runtime FILE*.

#include <cstdio>

#include "vynutil/binary_stream.h"

namespace VynSDK::Util {

class BinaryStreamFile final : public BinaryStream {
 public:
  // file must not be null; with owns the stream closes it.
  BinaryStreamFile(FILE* file, bool owns) noexcept : file_(file), owns_(owns) {}
  ~BinaryStreamFile() override;

  // The runtime's text for the saved error number, or a null string when none was saved.
  VynString LastError() override;
  // The runtime stream's end-of-file indicator.
  bool IsEndOfFile() const override;
  bool CanWrite() const override;
  std::size_t Read(void* buffer, std::size_t bytes) override;
  std::size_t Write(const void* data, std::size_t bytes) override;
  LONGLONG Seek(LONGLONG offset, int origin) override;
  void Flush() override;
  void Truncate() override;

 private:
  // The runtime needs a flush or a seek between writing and reading a stream in update mode.
  enum class LastTransfer { None, Read, Write };
  void SwitchTo(LastTransfer next);
  // Saves errno, or fallback when errno is 0.
  void SaveErrno(int fallback);

  FILE* file_;
  bool owns_;
  int error_ = 0;  // errno of the last failure, 0 when none
  LastTransfer last_ = LastTransfer::None;
};

}  // namespace VynSDK::Util
