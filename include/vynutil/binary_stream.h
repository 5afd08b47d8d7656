#pragma once
// Binary streams: one byte-stream interface over a growable memory buffer, a C runtime FILE* or a
// Win32 file handle. The text-file reader and writer work through it.
//
// Streams never throw. Failures show as short counts, -1 from Seek, the end-of-file state and the
// text of LastError(). A stream belongs to one user at a time. Streams are made only by the
// static factories of BinaryStream and are released with delete.

#include <cstddef>
#include <cstdio>

#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/vynstring.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util {

class BinaryStreamMemory;

class VYN_API BinaryStream : public VynHeapOperators {
 public:
  // Mode flags: the result of ParseStreamMode and the mode of FromFilename.
  static constexpr unsigned ModeRead = 0x1;
  static constexpr unsigned ModeWrite = 0x2;
  static constexpr unsigned ModeAppend = 0x4;  // read and write access
  static constexpr unsigned ModeTruncate = 0x8;
  static constexpr unsigned ModeCreate = 0x10;  // create the file when it is missing
  static constexpr unsigned ModeText = 0x20;    // the default
  static constexpr unsigned ModeBinary = 0x40;
  static constexpr unsigned ModeExclusive = 0x80;  // no sharing with other openers
  static constexpr unsigned ModeWriteThrough = 0x100;
  static constexpr unsigned ModeTemporary = 0x200;
  static constexpr unsigned ModeDeleteOnClose = 0x400;
  static constexpr unsigned ModeSequentialScan = 0x800;
  static constexpr unsigned ModeRandomAccess = 0x1000;

  // The virtual operations, in their fixed order.
  virtual ~BinaryStream();
  // The text of the last failure, or the null string when nothing failed.
  virtual VynString LastError() = 0;
  virtual bool IsEndOfFile() const = 0;
  // True for every kind of stream.
  virtual bool CanWrite() const = 0;
  // Copies up to bytes bytes to buffer; returns how many were read (0 for a null buffer).
  virtual std::size_t Read(void* buffer, std::size_t bytes) = 0;
  // Writes up to bytes bytes of data; returns how many were written.
  virtual std::size_t Write(const void* data, std::size_t bytes) = 0;
  // Moves the position: origin 0 from the start, 1 from the current position, 2 from the end.
  // Returns the new position, or -1 on failure.
  virtual LONGLONG Seek(LONGLONG offset, int origin) = 0;
  virtual void Flush() = 0;
  // Makes the stream end at the current position (cutting it, or extending it with zeros).
  virtual void Truncate() = 0;

  // A memory stream over data with size bytes allocated and valid, position 0. reallocate (may be
  // null: the buffer then never grows) is called as reallocate(data, newSize) to grow or shrink
  // the buffer; release (may be null) is called on the buffer when the stream is deleted. A null
  // data counts as an empty buffer whatever size says.
  static BinaryStreamMemory* FromMemory(void* data, std::size_t size,
                                        void* (*reallocate)(void*, std::size_t),
                                        void (*release)(void*));
  // The same without a reallocation callback: the buffer never grows.
  static BinaryStreamMemory* FromMemory(void* data, std::size_t size, void (*release)(void*));
  // A stream over an open runtime stream; with owns, the stream closes it (fclose) when deleted.
  // Null for a null file.
  static BinaryStream* FromFile(FILE* file, bool owns);
  // A stream over an open Win32 file handle; with owns, the stream closes it (CloseHandle) when
  // deleted. Null for a null or invalid handle.
  static BinaryStream* FromFileHandle(void* handle, bool owns);
  // Opens the file at path with the Mode flags and returns a stream that owns the handle. Before
  // a file is opened for writing, appending or truncating (unless it is temporary or deleted on
  // close) the host is asked to keep a base copy of it. On failure returns null and, when error
  // is not null, stores the system message of the failure in it.
  static BinaryStream* FromFilename(const VynString& path, unsigned mode, VynString* error);
  // Opens path for reading; write adds write access and creation, truncate cuts the file to 0
  // bytes (a missing file is an error unless write is also given), exclusive shares nothing.
  static BinaryStream* FromFilename(const VynString& path, bool write, bool truncate,
                                    bool exclusive, VynString* error);
  // The Mode flags of a mode text such as u"rb" or u"w+": r, r+, rw, w, w+, a, a+, b, t, c, n, e,
  // T, D, S, R and N in any order, starting from ModeText. 0 for a text with any other character;
  // ModeText for an empty or null text.
  static unsigned ParseStreamMode(const MCHAR* mode);

  BinaryStream(const BinaryStream&) = delete;
  BinaryStream& operator=(const BinaryStream&) = delete;

 protected:
  BinaryStream() = default;
};

// A stream over one memory buffer that the creator's callbacks grow and release. The length (the
// valid bytes) never exceeds the allocation; the position may lie anywhere, since Seek sets it
// without bounds, and reads and writes at a position beyond the data move nothing they cannot.
// Bytes between the old end and a write or truncation beyond it read as zeros, as in a file.
class VYN_API BinaryStreamMemory : public BinaryStream {
 public:
  ~BinaryStreamMemory() override;

  // A null string: a memory stream has no failures to tell about.
  VynString LastError() override;
  // The position is at or beyond the length.
  bool IsEndOfFile() const override;
  bool CanWrite() const override;
  std::size_t Read(void* buffer, std::size_t bytes) override;
  // With a null data the reserved bytes are zeroed.
  std::size_t Write(const void* data, std::size_t bytes) override;
  // Never fails: an unknown origin leaves the position where it is.
  LONGLONG Seek(LONGLONG offset, int origin) override;
  void Flush() override;
  // The length becomes the position (see Truncate(length)).
  void Truncate() override;

  // The buffer, and a pointer offset bytes into it (no further than the allocation).
  void* Data() const { return data_; }
  void* Data(std::size_t offset) const;
  // The buffer at the position (no further than the allocation).
  void* CurrentData() const;
  std::size_t CurrentPosition() const { return position_; }
  std::size_t Length() const { return length_; }
  std::size_t Allocated() const { return allocated_; }
  // The bytes from the position to the length; 0 at or beyond the length.
  std::size_t Remaining() const;

  // Reading in place: cuts bytes to Remaining(), returns the buffer at the position and moves the
  // position past those bytes.
  void* Read(std::size_t& bytes);
  // Writing in place: reserves bytes bytes at the position, growing the buffer when it can and
  // else cutting bytes to the room left; returns the buffer at the old position, moves the
  // position past the reserved bytes and raises the length to it.
  void* Write(std::size_t& bytes);
  // Opens a gap of bytes bytes at offset at (no further than the length), moving the data after it
  // up; the position stays. Returns the gap, or null (and changes nothing) when the buffer cannot
  // hold length + bytes.
  void* Insert(std::size_t at, std::size_t bytes);
  // Grows the allocation to at least bytes (to bytes + 32) when it is smaller. Returns whether at
  // least bytes are allocated afterwards.
  bool EnsureAllocated(std::size_t bytes);
  // Drops the data more than keep bytes before the position, moving the rest to the front.
  void Precate(std::size_t keep);
  // Gives back the allocation beyond the length (keeping at least one byte), when the stream has a
  // reallocation callback.
  void Compact();
  // Empties the stream; the allocation stays.
  void Reset();
  // The length becomes length, growing the buffer when it can and else stopping at the end of the
  // allocation; the position is lowered to the new length when beyond it.
  void Truncate(std::size_t length);

 private:
  friend class BinaryStream;
  BinaryStreamMemory(void* data, std::size_t size, void* (*reallocate)(void*, std::size_t),
                     void (*release)(void*));

  // Reallocates to exactly bytes; false (nothing changed) without a callback or when it fails.
  bool Reallocate(std::size_t bytes);
  // Makes room for needed bytes, growing to needed + 32 when the allocation is smaller.
  bool Grow(std::size_t needed);
  // Raises the length to end, zeroing what lies between.
  void ExtendLengthTo(std::size_t end);

  void* data_;
  std::size_t allocated_;
  std::size_t length_;
  std::size_t position_;
  void* (*reallocate_)(void*, std::size_t);
  void (*release_)(void*);
};

}  // namespace VynSDK::Util
