// BinaryStream: the interface's destructor and the factories over memory, FILE* and handles.

#include "vynutil/binary_stream.h"

#include <new>

#include "files/binary_stream_file.h"
#include "files/binary_stream_win32.h"

namespace VynSDK::Util {

BinaryStream::~BinaryStream() = default;

BinaryStreamMemory* BinaryStream::FromMemory(void* data, std::size_t size,
                                             void* (*reallocate)(void*, std::size_t),
                                             void (*release)(void*)) {
  return new (std::nothrow) BinaryStreamMemory(data, size, reallocate, release);
}

BinaryStreamMemory* BinaryStream::FromMemory(void* data, std::size_t size, void (*release)(void*)) {
  return FromMemory(data, size, nullptr, release);
}

BinaryStream* BinaryStream::FromFile(FILE* file, bool owns) {
  if (file == nullptr) return nullptr;
  return new (std::nothrow) BinaryStreamFile(file, owns);
}

BinaryStream* BinaryStream::FromFileHandle(void* handle, bool owns) {
  if (handle == nullptr || handle == INVALID_HANDLE_VALUE) return nullptr;
  return new (std::nothrow) BinaryStreamWin32(handle, owns);
}

}  // namespace VynSDK::Util
