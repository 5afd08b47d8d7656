#pragma once
// The host's chunked scene-file streams, as the library's persistent value types use them.
// The host implements them; the library only calls the operations below. Chunks nest: a chunk
// begun inside another is its child, and readers walk one level at a time.

#include "vynutil/wintypes.h"

// The result of a stream operation.
enum IOResult {
  IO_OK = 0,     // done
  IO_END = 1,    // no further chunk at this level
  IO_ERROR = 2,  // the operation failed (short read, write error, malformed data)
};

// The saving side.
class ISave {
 public:
  virtual ~ISave() = default;
  // Opens a chunk with a 16-bit identifier inside the current one.
  virtual void BeginChunk(USHORT id) = 0;
  // Closes the innermost open chunk.
  virtual void EndChunk() = 0;
  // Writes bytes into the open chunk; *written receives the count written. IO_OK on success.
  virtual IOResult Write(const void* buffer, ULONG bytes, ULONG* written) = 0;
  // Writes a zero-terminated wide string (terminator included) into the open chunk.
  virtual IOResult WriteWString(const MCHAR* text) = 0;
  // A request to the host's saving code, by code; its meaning is the host's.
  virtual INT_PTR Execute(int code, ULONG_PTR arg1 = 0, ULONG_PTR arg2 = 0, ULONG_PTR arg3 = 0) = 0;
};

// The loading side.
class ILoad {
 public:
  virtual ~ILoad() = default;
  // Opens the next chunk at the current level: IO_OK, or IO_END when none is left.
  virtual IOResult OpenChunk() = 0;
  // The identifier of the open chunk.
  virtual USHORT CurChunkID() = 0;
  // Reads bytes from the open chunk; *read receives the count read. IO_OK only when all were
  // read, else an IOResult error.
  virtual IOResult Read(void* buffer, ULONG bytes, ULONG* read) = 0;
  // Reads a zero-terminated wide string; *text points to it, owned by the stream.
  virtual IOResult ReadWStringChunk(MCHAR** text) = 0;
  // Closes the open chunk and returns to the enclosing level.
  virtual IOResult CloseChunk() = 0;
};
